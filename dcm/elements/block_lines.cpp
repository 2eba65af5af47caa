#include "dcm/elements/block_lines.h"

#include <algorithm>

namespace dcm {

BlockLines::BlockLines(FileTextView block) : m_left(block)
{
    if (block.bytes.starts_with('\n'))
        m_left.bytes = {};
}

bool BlockLines::Next(BlockLine& line)
{
    auto& [left, encoding] = m_left;
    for (;;) {
        const std::size_t end = left.find('\n');
        if (end == left.npos)
            return false;
        const std::string_view text = TrimLeft(left.substr(0, end), IsWhite);
        left.remove_prefix(end + 1);
        const char* const last = text.data() + text.size();
        // Keywords are short: the blank behind one is near.
        const char* const blank = std::find(text.data(), last, ' ');
        if (blank != last) {
            line = {{text.data(), blank}, {{blank + 1, last}, encoding}};
            return true;
        }
    }
}

FileTextView TakeName(FileTextView& rest)
{
    const std::string_view text = rest.bytes;
    const std::size_t blank = text.find(' ');
    if (blank == text.npos) {
        rest = TrimWhite(rest);
        return {{}, rest.encoding};
    }
    rest.bytes = TrimWhite(text.substr(blank));
    return {TrimRight(text.substr(0, blank), IsWhite), rest.encoding};
}

} // namespace dcm
