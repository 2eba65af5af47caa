#include "dcm/elements/block_lines.h"

#include <algorithm>

namespace dcm {

BlockLines::BlockLines(std::wstring_view block)
    : m_left(block.starts_with(L'\n') ? std::wstring_view() : block)
{}

bool BlockLines::Next(BlockLine& line)
{
    for (;;) {
        const std::size_t end = m_left.find(L'\n');
        if (end == m_left.npos)
            return false;
        const std::wstring_view text = TrimLeft({m_left.data(), end}, IsWhite);
        m_left.remove_prefix(end + 1);
        const wchar_t* const last = text.data() + text.size();
        // Keywords are short: the blank behind one is near.
        const wchar_t* const blank = std::find(text.data(), last, L' ');
        if (blank != last) {
            line = {{text.data(), blank}, {blank + 1, last}};
            return true;
        }
    }
}

std::wstring_view TakeName(std::wstring_view& rest)
{
    const std::wstring_view text = rest;
    const std::size_t blank = text.find(L' ');
    if (blank == text.npos) {
        rest = TrimWhite(text);
        return {};
    }
    rest = TrimWhite(text.substr(blank));
    return TrimRight(text.substr(0, blank), IsWhite);
}

} // namespace dcm
