#pragma once

#include "dcm/platform/wide_product.h"
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
// so the exact product lies in [H, H + 2) in units of 2^64. Rounding it at a higher bit needs to
// know on which side of a point B, halfway between two results, it lies: above when H > B, below
// when H + 2 <= B. H = B and H = B - 1 do not tell; those few numbers are converted in another,
// exact way. (Just below an exact result the interval may contain that result. Both its ends round
// to it.) The same holds with 64 instead of 128 bits of T and H.
namespace dcm {

constexpr std::uint64_t kTenTo8 = 100'000'000;

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

/// The upper 128 bits of a power of ten: T as explained above.
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

/// H, the upper 128 bits of w x T.
constexpr WideProduct UpperProduct(std::uint64_t w, const Power& power)
{
    const auto upper = Multiply(w, power.high);
    const auto low = upper.low + Multiply(w, power.low).high;
    return {upper.high + (low < upper.low ? 1 : 0), low};
}

/// The bits of the lowest double from each power of ten on that is a normal number.
constexpr int kMinNormalPower = -307;
constexpr int kMaxNormalPower = 308;
extern const std::array<std::uint64_t, kMaxNormalPower - kMinNormalPower + 1> kPowerBits;

/// `value`, finite and above zero, correctly rounded to `count` (15 or 17) significant digits, ties
/// to even: `digits` has just that many. By the standard library.
Decimal ToDecimalExactly(double value, int count) noexcept;

/// The same for a normal number above zero, given by its bits: for almost all by one product. Where
/// rounding up adds a digit, `digits` is 10^count.
inline Decimal ToDecimal(std::uint64_t bits, int count) noexcept
{
    // The number is w x 2^exponent, with the highest bit of w set.
    const auto w = bits << (63 - kFractionBits) | kSignBit;
    const int exponent = static_cast<int>(bits >> kFractionBits) - kExponentBias - 63;

    // The power of ten of the first digit: that of the power of two, or one more from the next
    // power of ten on.
    const int below = Exponent10(exponent + 63);
    const auto next = kPowerBits[static_cast<std::size_t>(below + 1 - kMinNormalPower)];
    const int first = below + (bits >= next ? 1 : 0);

    // The upper word of H has `places` bits after the point.
    const int last = first - count + 1;
    const auto& power = kPowers[PowerIndex(-last)];
    const int places = -1 - exponent - Exponent2(-last);
    const auto half = std::uint64_t{1} << (places - 1);
    const auto isOpen = [half](std::uint64_t high) {
        return ((high + half + 1) & (2 * half - 1)) <= 1;
    };
    auto high = Multiply(w, power.high).high;
    if (isOpen(high)) [[unlikely]] {
        const auto product = UpperProduct(w, power);
        if (isOpen(product.high) && product.low + 1 <= 1)
            return ToDecimalExactly(std::bit_cast<double>(bits), count);
        high = product.high;
    }
    return {(high + half) >> places, last};
}

/// Between these powers of ten, every product with 64 bits of digits is a normal number.
constexpr int kMinSafePower = -290;
constexpr int kMaxSafePower = 288;

/// Stores the double nearest to `decimal` and returns true; false when one product of 64 bits does
/// not tell, as for one number of many digits in five hundred, or when the power of ten is not
/// safe.
inline bool ToDouble(Decimal decimal, double& value) noexcept
{
    if (decimal.digits == 0) {
        value = 0.0;
        return true;
    }
    const auto index = static_cast<unsigned>(decimal.exponent - kMinSafePower);
    if (index > kMaxSafePower - kMinSafePower)
        return false;
    const int zeros = std::countl_zero(decimal.digits);
    const auto& power = kPowers[index + PowerIndex(kMinSafePower)];
    const auto h = Multiply(decimal.digits << zeros, power.high).high;
    // H becomes a significand of 53 bits and 10 more. Where it loses a bit by that, the exact
    // product still lies in [H, H + 2).
    constexpr int places = 10;
    constexpr auto half = std::uint64_t{1} << (places - 1);
    const int above = static_cast<int>(h >> 63);
    const auto significand = h >> above;
    if ((significand + 1 - half) % (2 * half) <= 1)
        return false;
    // The significand's highest bit adds 1 to the exponent, and rounding up may carry into it.
    constexpr int offset = places + kFractionBits + kExponentBias;
    const int biased = Exponent2(decimal.exponent) + above + (offset - zeros);
    value = std::bit_cast<double>((static_cast<std::uint64_t>(biased) << kFractionBits) +
                                  ((significand + half) >> places));
    return true;
}

/// The eight characters at `at`, with 0 to 9 for digits.
inline std::uint64_t DigitBytes(const char* at)
{
    return LoadWord(at) ^ RepeatByte('0');
}

/// What NotDigits marks a byte with.
constexpr unsigned kNotDigitBit = 7;
constexpr unsigned char kNotDigit = 1 << kNotDigitBit;

/// The highest bit of each byte that is not a digit, 0 for each that is: adding 118 sets it for 10
/// and more. After a byte from 0x8A on, whose sum carries into the next, a digit may be marked too.
constexpr std::uint64_t NotDigits(std::uint64_t bytes)
{
    return (bytes | (bytes + RepeatByte(kNotDigit - 10))) & RepeatByte(kNotDigit);
}

/// The number whose digits are the bytes 0 to 9 of a word, the first in the lowest byte.
constexpr std::uint64_t JoinEight(std::uint64_t bytes)
{
    // Each step joins neighbours: pairs of digits, of two digits, of four.
    bytes = (bytes * 10 + (bytes >> 8)) & 0x00FF'00FF'00FF'00FF;
    bytes = (bytes * (1 + (100 << 16))) >> 16 & 0x0000'FFFF'0000'FFFF;
    return (bytes * (1 + (std::uint64_t{10'000} << 32))) >> 32;
}

/// The same for four digits.
constexpr std::uint32_t JoinFour(std::uint32_t bytes)
{
    bytes = (bytes * 10 + (bytes >> 8)) & 0x00FF'00FF;
    return (bytes * (1 + (100 << 16))) >> 16;
}

/// The reverse of JoinEight: the eight digits of a number below 10^8.
constexpr std::uint64_t SplitEight(std::uint64_t number)
{
    // Each step divides all parts at once, by a product with the reciprocal, rounded up, which is
    // exact for parts this small. The quotient q goes to the lower half of a part and the remainder
    // n - q x d to the upper half: together (n << half) - q x ((d << half) - 1).
    const auto thousands = (number * 109'951'163) >> 40;
    const auto two = (number << 32) - thousands * ((std::uint64_t{10'000} << 32) - 1);
    const auto hundreds = ((two * 10'486) >> 20) & 0x0000'007F'0000'007F;
    const auto four = (two << 16) - hundreds * ((100 << 16) - 1);
    const auto tens = ((four * 103) >> 10) & 0x000F'000F'000F'000F;
    return (four << 8) - tens * ((10 << 8) - 1);
}

} // namespace dcm
