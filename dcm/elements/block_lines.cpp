#include "dcm/elements/block_lines.h"

#include <cstdint>

namespace dcm {

namespace {

/// The next character up to a blank: there a word ends. At `end` or behind it when there is none.
const char* SkipWord(const char* at, const char* end)
{
    for (; at < end; at += 8) {
        // Only bytes below 0x21 borrow from their highest bit; where one does, those behind it may
        // be taken for such bytes too.
        const std::uint64_t text = LoadWord(at);
        const std::uint64_t low = (text - RepeatByte(0x21)) & ~text & RepeatByte(0x80);
        if (low != 0)
            return at + LowestByteSet(low);
    }
    return at;
}

} // namespace

bool BlockLines::Next(BlockLine& line)
{
    while (m_next < m_block.LineCount()) {
        const auto [bytes, file] = m_block.Line(m_next++);
        const char* const end = bytes.data() + bytes.size();
        const char* const start = SkipWhite(bytes.data(), end);
        const char* blank = SkipWord(start, end);
        while (blank < end && *blank != ' ')
            blank = SkipWord(blank + 1, end);
        if (blank < end) {
            line = {{start, blank}, {{blank + 1, end}, file}};
            return true;
        }
    }
    return false;
}

FileTextView TakeName(FileTextView& rest)
{
    const std::string_view text = rest.bytes;
    const std::size_t blank = text.find(' ');
    if (blank == text.npos) {
        rest = TrimWhite(rest);
        return {{}, rest.file};
    }
    rest.bytes = TrimWhite(text.substr(blank));
    return {TrimRight(text.substr(0, blank), IsWhite), rest.file};
}

} // namespace dcm
