#pragma once

#include <algorithm>
#include <string_view>

/// What white space and letter case mean in this format, for views of wide text.
namespace dcm {

/// White space is U+0009 to U+000D and U+0020, whatever the locale.
constexpr bool IsWhite(wchar_t c)
{
    return c == L' ' || (c >= L'\t' && c <= L'\r');
}

/// Lower case of A to Z; any other character stays as it is.
constexpr wchar_t FoldCase(wchar_t c)
{
    return c >= L'A' && c <= L'Z' ? static_cast<wchar_t>(c + (L'a' - L'A')) : c;
}

constexpr bool EqualsNoCase(std::wstring_view a, std::wstring_view b)
{
    return a.size() == b.size() &&
           std::equal(a.begin(), a.end(), b.begin(),
                      [](wchar_t x, wchar_t y) { return x == y || FoldCase(x) == FoldCase(y); });
}

/// `text` without the white space at its start.
constexpr std::wstring_view TrimLeftWhite(std::wstring_view text)
{
    std::size_t start = 0;
    while (start < text.size() && IsWhite(text[start]))
        ++start;
    return text.substr(start);
}

/// `text` without the white space at its end.
constexpr std::wstring_view TrimRightWhite(std::wstring_view text)
{
    std::size_t end = text.size();
    while (end > 0 && IsWhite(text[end - 1]))
        --end;
    return text.substr(0, end);
}

/// `text` without the white space at both ends.
constexpr std::wstring_view TrimWhite(std::wstring_view text)
{
    return TrimRightWhite(TrimLeftWhite(text));
}

/// `text` without any of `characters` at both ends.
constexpr std::wstring_view Trim(std::wstring_view text, std::wstring_view characters)
{
    const std::size_t start = text.find_first_not_of(characters);
    if (start == text.npos)
        return {};
    return text.substr(start, text.find_last_not_of(characters) - start + 1);
}

} // namespace dcm
