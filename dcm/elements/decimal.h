#pragma once

#include "dcm/platform/word.h"

#include <array>
#include <bit>
#include <cstddef>
#include <cstdint>

// The fast conversions between doubles, decimal digits and characters.
//
// How one product converts both ways: each power of ten is 10^q = (T + d) x 2^(Exponent2(q) - 127),
// where T is the 128-bit integer of the table, its highest bit set, and 0 <= d < 1 is what the
// table leaves out. Let w be a 64-bit integer. With H, the upper 128 bits of the product w x T of
// 192 bits,
//
//     H x 2^64  <=  w x (T + d)  <  w x T + 2^64  <  (H + 2) x 2^64,
//
// so the exact product lies in [H, H + 2) in units of 2^64. To round it at a higher bit is to ask
// on which side of a point B half-way between two results it lies: above when H > B, below when
// H + 2 <= B. Only H = B and H = B - 1 leave it open, and those few numbers go another, exact way.
// (Where the interval reaches past a result, as it does just short of an exact one, both its ends
// round to that result.) The same holds with 64 in place of 128 bits of T and H.
namespace dcm {

/// Like std::uint64_t, twice as wide.
// NOLINTNEXTLINE(modernize-use-using): only a typedef can carry the mark of an extension.
__extension__ typedef unsigned __int128 uint128;

constexpr std::uint64_t kTenTo8 = 100'000'000;
constexpr std::uint64_t kTenTo16 = kTenTo8 * kTenTo8;

/// The layout of a double: sign, 11 bits of exponent, 52 of fraction.
constexpr std::uint64_t kSignBit = 0x8000'0000'0000'0000;
constexpr std::uint64_t kInfinityBits = 0x7FF0'0000'0000'0000;
constexpr int kFractionBits = 52;
constexpr int kExponentBias = 1023;

/// The number digits x 10^exponent.
struct Decimal
{
    std::uint64_t digits = 0;
    int exponent = 0;
};

/// A power of ten's upper 128 bits: T above.
struct Power
{
    std::uint64_t high;
    std::uint64_t low;
};

constexpr int kMinPower = -342;
constexpr int kMaxPower = 341;
extern const std::array<Power, kMaxPower - kMinPower + 1> kPowers;

/// The index of a power of ten in kPowers.
constexpr std::size_t PowerIndex(int power)
{
    return static_cast<std::size_t>(power - kMinPower);
}

/// floor(log2(10^power)).
constexpr int Exponent2(int power)
{
    return (power * 217'706) >> 16;
}

/// floor(log10(2^power)).
constexpr int Exponent10(int power)
{
    return (power * 1'262'611) >> 22;
}

/// `value`, finite and above zero, correctly rounded to `count` (15 or 17) significant digits, ties
/// to even: `digits` has just that many. By the standard library.
Decimal ToDecimalExactly(double value, int count) noexcept;

/// ToDecimalExactly, for almost all numbers by one product.
inline Decimal ToDecimal(double value, int count) noexcept
{
    const auto bits = std::bit_cast<std::uint64_t>(value);
    const auto biased = static_cast<int>(bits >> kFractionBits);
    if (biased == 0) {
        return ToDecimalExactly(value, count);
    }
    // value = w x 2^exponent, the highest bit of w set.
    const auto w = bits << (63 - kFractionBits) | kSignBit;
    const int exponent = biased - kExponentBias - 63;

    // The first digit's power of ten: that of the power of two, or one more when the next power of
    // ten lies between that and the value.
    int first = Exponent10(exponent + 63);
    const auto& next = kPowers[PowerIndex(first + 1)];
    first += static_cast<int>(Exponent2(first + 1) == exponent + 63) &
             static_cast<int>(w >= next.high + (next.low != 0 ? 1 : 0));

    // The upper word of H has `places` bits behind the point.
    const int last = first - count + 1;
    const auto& power = kPowers[PowerIndex(-last)];
    const auto h = uint128{w} * power.high + ((uint128{w} * power.low) >> 64);
    const auto high = static_cast<std::uint64_t>(h >> 64);
    const auto low = static_cast<std::uint64_t>(h);
    const int places = -1 - exponent - Exponent2(-last);
    const auto half = std::uint64_t{1} << (places - 1);
    const auto behind = high & (2 * half - 1);
    if (behind + 1 - half <= 1 && low + 1 <= 1) {
        return ToDecimalExactly(value, count);
    }
    const auto digits = (high + half) >> places;
    const auto limit = count == 17 ? 10 * kTenTo16 : kTenTo16 / 10;
    return digits == limit ? Decimal{limit / 10, last + 1} : Decimal{digits, last};
}

/// Stores the double nearest to `decimal` and returns true; false when this way cannot tell, as for
/// one number of many digits in five hundred, or when the result is not a normal number.
inline bool ToDouble(Decimal decimal, double& value) noexcept
{
    if (decimal.digits == 0) {
        value = 0.0;
        return true;
    }
    const auto index = static_cast<unsigned>(decimal.exponent - kMinPower);
    if (index >= kPowers.size()) {
        return false;
    }
    const int zeros = std::countl_zero(decimal.digits);
    const auto product = uint128{decimal.digits << zeros} * kPowers[index].high;
    const auto h = static_cast<std::uint64_t>(product >> 64);
    // H becomes a significand of 53 bits and 10 more. Where it loses a bit by that, the exact
    // product still lies in [H, H + 2).
    constexpr int places = 10;
    constexpr auto half = std::uint64_t{1} << (places - 1);
    const int above = static_cast<int>(h >> 63);
    const auto significand = h >> above;
    const int biased =
        Exponent2(decimal.exponent) + 1 + above - zeros + places + kFractionBits + kExponentBias;
    if ((significand + 1 - half) % (2 * half) <= 1 || biased < 1 || biased >= 2 * kExponentBias) {
        return false;
    }
    // The significand's highest bit adds 1 to the exponent, and rounding up may carry into it.
    value = std::bit_cast<double>((static_cast<std::uint64_t>(biased - 1) << kFractionBits) +
                                  ((significand + half) >> places));
    return true;
}

/// LoadWord, with 0 to 9 for digits.
inline std::uint64_t DigitBytes(const char* at)
{
    return LoadWord(at) ^ RepeatByte('0');
}

/// What NotDigits marks a byte with.
constexpr std::uint64_t kNotDigit = 0x80;

/// The highest bit of each byte that is not a digit, nothing of those that are: only 10 and more
/// reach it with the added 118. Behind a byte from 0x8A on, out of which the sum carries, digits
/// may be marked too.
constexpr std::uint64_t NotDigits(std::uint64_t bytes)
{
    return (bytes | (bytes + RepeatByte(kNotDigit - 10))) & RepeatByte(kNotDigit);
}

/// The highest bit of each byte that is not a point, and any other bits. A slash behind a point is
/// taken for another one.
constexpr std::uint64_t NotPoints(std::uint64_t bytes)
{
    // The sum is the byte's negative, with the highest bit for 1 to 128. It carries out of a point
    // only, which makes a negative of 0 for the slash: that is 1 here.
    const auto others = bytes ^ RepeatByte('.' ^ '0');
    return others | (~others + RepeatByte(1));
}

/// Whether bytes that are digits or points are all digits.
constexpr bool AreDigits(std::uint64_t bytes)
{
    return (bytes & RepeatByte(('.' ^ '0') & 0xF0)) == 0;
}

/// The number whose digits are the bytes 0 to 9 of a word, the first in the lowest byte.
constexpr std::uint64_t JoinEight(std::uint64_t bytes)
{
    // Two digits, four, eight: each step joins neighbours by one product.
    bytes = (bytes * (1 + (10 << 8))) >> 8 & 0x00FF'00FF'00FF'00FF;
    bytes = (bytes * (1 + (100 << 16))) >> 16 & 0x0000'FFFF'0000'FFFF;
    return (bytes * (1 + (std::uint64_t{10'000} << 32))) >> 32;
}

/// The reverse of JoinEight: the eight digits of a number below 10^8.
constexpr std::uint64_t SplitEight(std::uint64_t number)
{
    // Each step divides all parts at once, by a product with the rounded-up reciprocal that is
    // exact for parts this small. The quotient q takes the lower half of the part's room and the
    // remainder n - q x d the upper half: together (n << half) - q x ((d << half) - 1).
    const auto two = (number << 32) - number / 10'000 * ((std::uint64_t{10'000} << 32) - 1);
    const auto hundreds = ((two * 10'486) >> 20) & 0x0000'007F'0000'007F;
    const auto four = (two << 16) - hundreds * ((100 << 16) - 1);
    const auto tens = ((four * 103) >> 10) & 0x000F'000F'000F'000F;
    return (four << 8) - tens * ((10 << 8) - 1);
}

} // namespace dcm
