#include "dcm/elements/block_reader.h"

#include "dcm/platform/word.h"

#include <cstdint>

namespace dcm {

namespace {

/// The first character at or after `at` that is a blank or lower, which is where a word ends; `end`
/// or later when there is none.
const char* SkipWord(const char* at, const char* end)
{
    for (; at < end; at += 8) {
        // The subtraction sets the highest bit of bytes below 0x21. A borrow may set it in the
        // bytes after such a byte as well, but only the first one counts.
        const std::uint64_t text = LoadWord(at);
        const std::uint64_t low = (text - RepeatByte(0x21)) & ~text & RepeatByte(0x80);
        if (low != 0)
            return at + LowestByteSet(low);
    }
    return at;
}

} // namespace

std::string_view TakeWord(std::string_view& rest)
{
    const std::string_view text = rest;
    const std::size_t blank = text.find(' ');
    if (blank == text.npos) {
        rest = TrimWhite(text);
        return {};
    }
    rest = TrimWhite(text.substr(blank));
    return TrimRight(text.substr(0, blank), IsWhite);
}

bool BlockReader::Next(BlockLine& line)
{
    while (m_next < m_block.LineCount()) {
        const std::string_view bytes = m_block.Line(m_next++);
        const char* const end = bytes.data() + bytes.size();
        const char* const start = SkipWhite(bytes.data(), end);
        const char* blank = SkipWord(start, end);
        while (blank < end && *blank != ' ')
            blank = SkipWord(blank + 1, end);
        if (blank < end) {
            line = {{start, blank}, {blank + 1, end}};
            if (m_report != nullptr)
                m_report->KeywordLine(m_next - 1, line.keyword, line.rest);
            return true;
        }
        if (m_report != nullptr)
            m_report->OtherLine(m_next - 1, bytes);
    }
    if (m_report != nullptr)
        m_report->End();
    return false;
}

} // namespace dcm
