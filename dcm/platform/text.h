#pragma once

#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

/// What white space and letter case mean in this format. All that they concern is ASCII, so that
/// text is cut and compared as it stands in its file.
namespace dcm {

/// White space is U+0009 to U+000D and U+0020, whatever the locale.
constexpr bool IsWhite(char c)
{
    return c <= ' ' && (c == ' ' || (c >= '\t' && c <= '\r'));
}

/// The eight characters at `at` in the bytes of a word, the first in the lowest.
inline std::uint64_t EightCharacters(const char* at)
{
    std::uint64_t text = 0;
    if constexpr (std::endian::native == std::endian::little) {
        std::memcpy(&text, at, sizeof text);
    } else {
        for (int i = 0; i < 8; ++i)
            text |= std::uint64_t{static_cast<unsigned char>(at[i])} << (8 * i);
    }
    return text;
}

/// Eight times the byte `value`.
constexpr std::uint64_t EightTimes(unsigned char value)
{
    return value * std::uint64_t{0x0101'0101'0101'0101};
}

/// The place of the lowest byte of `word`, which is not zero, with a bit that is set.
inline std::size_t FirstByte(std::uint64_t word)
{
    return static_cast<std::size_t>(std::countr_zero(word)) / 8;
}

/// Where the white space at `at` is over, `end` at the latest. Eight characters behind `end` may be
/// looked at.
inline const char* SkipWhite(const char* at, const char* end)
{
    while (at < end) {
        const std::uint64_t others = EightCharacters(at) ^ EightTimes(' ');
        if (others == 0) {
            at += 8;
            continue;
        }
        at += FirstByte(others);
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
