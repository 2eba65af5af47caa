#pragma once

#include "dcm/platform/cstring.h"

#include <cstddef>
#include <cstdint>
#include <string_view>

/// Conversion between bytes and wide characters. In each of these encodings a text can be cut at
/// any ASCII character before it is decoded: such a character is one byte, its own number, and that
/// byte is part of no other character.
namespace dcm {

enum class Encoding : unsigned char
{
    kWindows1252,
    kLatin1,
    kUtf8,
    /// UTF-8 for text of the host, which need not be Unicode: every wide character comes back,
    /// whatever its number. A character takes up to seven bytes, and a zero takes two, so that no
    /// byte is zero.
    kLenientUtf8,
};

/// The most bytes that one wide character becomes.
constexpr std::size_t MaxBytes(Encoding encoding)
{
    // In UTF-8, two wide characters of 16 bits make a character of four bytes.
    constexpr bool narrow = sizeof(wchar_t) == 2;
    if (encoding == Encoding::kUtf8)
        return narrow ? 3 : 4;
    if (encoding == Encoding::kLenientUtf8)
        return narrow ? 3 : 7;
    return 1;
}

/// Encodes `text` at `to`, where there must be room for `MaxBytes` of each character, and returns
/// the end. A zero, which would end the text for its readers, and a character that the encoding
/// lacks become `?`; in UTF-8 a number that is no character becomes U+FFFD.
char* Encode(std::wstring_view text, Encoding encoding, char* to);

/// Appends the wide form of `bytes` to `text`. In UTF-8, bytes that are not a character become
/// U+FFFD.
void AppendDecoded(CString& text, std::string_view bytes, Encoding encoding);

/// Takes one character off the start of `text`, which must not be empty: with wide characters of 16
/// bits, a surrogate pair is one. A surrogate without its other half is its own number.
std::uint32_t TakeCharacter(std::wstring_view& text);

/// The wide form of `bytes`.
CString Decode(std::string_view bytes, Encoding encoding);

/// `bytes`, which must not be empty, without its first character.
std::string_view WithoutFirstCharacter(std::string_view bytes, Encoding encoding);

/// What bytes look like when they are taken for UTF-8.
struct Utf8Look
{
    /// The first byte of the first character of several bytes, and the first byte that is no part
    /// of a character; `npos` for none.
    std::size_t firstWide = std::string_view::npos;
    std::size_t firstBad = std::string_view::npos;
};

/// Looks at `bytes` up to the first that is no part of a character.
Utf8Look LookAsUtf8(std::string_view bytes);

} // namespace dcm
