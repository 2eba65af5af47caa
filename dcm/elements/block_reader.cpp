#include "dcm/elements/block_reader.h"

#include "dcm/platform/word.h"

#include <cstdint>

namespace dcm {

namespace {

/// The first blank at or after `at`; `end` or later when there is none.
const char* FindBlank(const char* at, const char* end)
{
    for (; at < end; at += 8) {
        const std::uint64_t blanks = BytesBelow(LoadWord(at) ^ RepeatByte(' '), 1);
        if (blanks != 0)
            return at + LowestByteSet(blanks);
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

bool CutLine(std::string_view bytes, BlockLine& line)
{
    const char* const end = bytes.data() + bytes.size();
    const char* const start = SkipWhite(bytes.data(), end);
    const char* const blank = FindBlank(start, end);
    if (blank >= end)
        return false;
    line = {{start, blank}, {blank + 1, end}};
    return true;
}

} // namespace dcm
