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

/// `text` without the characters at its start for which `isTrimmed` holds.
template <class Predicate>
constexpr std::wstring_view TrimLeft(std::wstring_view text, Predicate isTrimmed)
{
    const wchar_t* const end = text.data() + text.size();
    const wchar_t* start = text.data();
    while (start != end && isTrimmed(*start))
        ++start;
    return {start, static_cast<std::size_t>(end - start)};
}

/// `text` without the characters at its end for which `isTrimmed` holds.
template <class Predicate>
constexpr std::wstring_view TrimRight(std::wstring_view text, Predicate isTrimmed)
{
    const wchar_t* end = text.data() + text.size();
    while (end != text.data() && isTrimmed(end[-1]))
        --end;
    return {text.data(), static_cast<std::size_t>(end - text.data())};
}

/// `text` without the characters at both ends for which `isTrimmed` holds.
template <class Predicate>
constexpr std::wstring_view Trim(std::wstring_view text, Predicate isTrimmed)
{
    return TrimRight(TrimLeft(text, isTrimmed), isTrimmed);
}

constexpr std::wstring_view TrimWhite(std::wstring_view text)
{
    return Trim(text, IsWhite);
}

constexpr std::wstring_view TrimBlanks(std::wstring_view text)
{
    return Trim(text, [](wchar_t c) { return c == L' '; });
}

constexpr std::wstring_view TrimQuotes(std::wstring_view text)
{
    return Trim(text, [](wchar_t c) { return c == L'"'; });
}

/// `text` without the blanks and double quotes at both ends, in any mix.
constexpr std::wstring_view TrimBlanksAndQuotes(std::wstring_view text)
{
    return Trim(text, [](wchar_t c) { return c == L' ' || c == L'"'; });
}

} // namespace dcm
