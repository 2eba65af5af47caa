#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>

/// Looking at eight characters at a time, as the bytes of one word.
namespace dcm {

/// How many bytes must be readable after a text, so that code that loads eight bytes at a time need
/// not check for the end first.
inline constexpr std::size_t kReadAhead = 8;

/// The eight characters at `at` as the bytes of a word, the first in the lowest byte.
inline std::uint64_t LoadWord(const char* at)
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

/// The reverse: writes the bytes of `word` as eight characters, the lowest byte first.
inline void StoreWord(std::uint64_t word, char* to)
{
    if constexpr (std::endian::native == std::endian::little) {
        std::memcpy(to, &word, sizeof word);
    } else {
        for (int i = 0; i < 8; ++i)
            to[i] = static_cast<char>(word >> (8 * i));
    }
}

/// A word of eight bytes, each of them `value`.
constexpr std::uint64_t RepeatByte(unsigned char value)
{
    return value * std::uint64_t{0x0101'0101'0101'0101};
}

/// The highest bit of the lowest byte of `word` that is below `limit`, which is at most 0x80; 0
/// when there is none. Bits of bytes above that one may be set too.
constexpr std::uint64_t BytesBelow(std::uint64_t word, unsigned char limit)
{
    // The subtraction borrows from the next byte only where a byte is below the limit.
    return (word - RepeatByte(limit)) & ~word & RepeatByte(0x80);
}

/// The index of the lowest byte of `word` that has a bit set. `word` must not be zero.
inline std::size_t LowestByteSet(std::uint64_t word)
{
    return static_cast<unsigned>(std::countr_zero(word)) / 8;
}

} // namespace dcm
