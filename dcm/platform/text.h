#pragma once

#include "dcm/platform/word.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string_view>

/// What white space and letter case mean in this format. Both concern ASCII only, so the bytes of a
/// file are trimmed and compared without being converted.
namespace dcm {

/// White space is U+0009 to U+000D and U+0020 in every locale.
constexpr bool IsWhite(char c)
{
    return c <= ' ' && (c == ' ' || (c >= '\t' && c <= '\r'));
}

/// The first character at or after `at` that is not white space, or `end`. `kReadAhead` characters
/// after `end` must be readable.
inline const char* SkipWhite(const char* at, const char* end)
{
    while (at < end) {
        const std::uint64_t others = LoadWord(at) ^ RepeatByte(' ');
        if (others == 0) {
            at += 8;
            continue;
        }
        at += LowestByteSet(others);
        if (!IsWhite(*at))
            break;
        ++at;
    }
    return std::min(at, end);
}

/// Lower case of A to Z; any other character stays as it is.
constexpr wchar_t FoldCase(wchar_t c)
{
    return c >= L'A' && c <= L'Z' ? static_cast<wchar_t>(c + (L'a' - L'A')) : c;
}

/// Whether text of a file is `word`, which is ASCII, in letters of any case.
template <class Character>
constexpr bool EqualsNoCase(std::string_view text, std::basic_string_view<Character> word)
{
    return text.size() == word.size() &&
           std::equal(text.begin(), text.end(), word.begin(), [](char narrow, Character c) {
               const auto x = static_cast<wchar_t>(static_cast<unsigned char>(narrow));
               const auto y = static_cast<wchar_t>(c);
               return x == y || FoldCase(x) == FoldCase(y);
           });
}

constexpr bool EqualsNoCase(std::string_view text, std::wstring_view keyword)
{
    return EqualsNoCase<wchar_t>(text, keyword);
}

/// `text` without the characters at its start for which `isTrimmed` holds.
template <class Predicate>
constexpr std::string_view TrimLeft(std::string_view text, Predicate isTrimmed)
{
    const char* const end = text.data() + text.size();
    const char* start = text.data();
    while (start != end && isTrimmed(*start))
        ++start;
    return {start, static_cast<std::size_t>(end - start)};
}

/// `text` without the characters at its end for which `isTrimmed` holds.
template <class Predicate>
constexpr std::string_view TrimRight(std::string_view text, Predicate isTrimmed)
{
    const char* end = text.data() + text.size();
    while (end != text.data() && isTrimmed(end[-1]))
        --end;
    return {text.data(), static_cast<std::size_t>(end - text.data())};
}

/// `text` without the characters at both ends for which `isTrimmed` holds.
template <class Predicate>
constexpr std::string_view Trim(std::string_view text, Predicate isTrimmed)
{
    return TrimRight(TrimLeft(text, isTrimmed), isTrimmed);
}

constexpr std::string_view TrimWhite(std::string_view text)
{
    return Trim(text, IsWhite);
}

constexpr std::string_view TrimBlanks(std::string_view text)
{
    return Trim(text, [](char c) { return c == ' '; });
}

constexpr std::string_view TrimQuotes(std::string_view text)
{
    return Trim(text, [](char c) { return c == '"'; });
}

/// `text` without the blanks and double quotes at both ends, in any mix.
constexpr std::string_view TrimBlanksAndQuotes(std::string_view text)
{
    return Trim(text, [](char c) { return c == ' ' || c == '"'; });
}

} // namespace dcm
