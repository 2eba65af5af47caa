#include "dcm/elements/block_lines.h"

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
        const std::wstring_view text = TrimLeftWhite(m_left.substr(0, end));
        m_left.remove_prefix(end + 1);
        const std::size_t blank = text.find(L' ');
        if (blank != text.npos) {
            line = {text.substr(0, blank), text.substr(blank + 1)};
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
    return TrimRightWhite(text.substr(0, blank));
}

std::wstring_view Unquoted(std::wstring_view rest)
{
    return Trim(rest, L" \"");
}

} // namespace dcm
