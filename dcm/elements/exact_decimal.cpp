#include "dcm/elements/exact_decimal.h"

#include "dcm/elements/decimal.h"

#include <algorithm>
#include <bit>
#include <charconv>
#include <cstdlib>
#include <limits>

namespace dcm {
namespace {

constexpr int kWordBits = 32;

/// A whole number of any size that NearestDouble needs.
class BigInteger
{
public:
    /// Multiplies by `factor`, then adds `summand`.
    void MultiplyAndAdd(std::uint32_t factor, std::uint32_t summand)
    {
        std::uint64_t carry = summand;
        for (std::size_t i = 0; i < m_size; ++i) {
            carry += std::uint64_t{m_words[i]} * factor;
            m_words[i] = static_cast<std::uint32_t>(carry);
            carry >>= kWordBits;
        }
        if (carry != 0)
            m_words[m_size++] = static_cast<std::uint32_t>(carry);
    }

    /// Divides, rounding down; returns whether there is a remainder.
    bool Divide(std::uint32_t divisor)
    {
        std::uint64_t rest = 0;
        for (std::size_t i = m_size; i-- > 0;) {
            rest = rest << kWordBits | m_words[i];
            m_words[i] = static_cast<std::uint32_t>(rest / divisor);
            rest %= divisor;
        }
        m_size -= m_words[m_size - 1] == 0 ? 1 : 0;
        return rest != 0;
    }

    /// Multiplies by 2^(32 x count).
    void ShiftUp(std::size_t count)
    {
        auto* const end = m_words.begin() + static_cast<std::ptrdiff_t>(m_size);
        std::copy_backward(m_words.begin(), end, end + static_cast<std::ptrdiff_t>(count));
        std::fill_n(m_words.begin(), count, 0);
        m_size += count;
    }

    std::size_t Size() const { return m_size; }

    /// The word with `place` words above it; 0 below the lowest.
    std::uint64_t FromTop(std::size_t place) const
    {
        return place < m_size ? m_words[m_size - 1 - place] : 0;
    }

    bool AnyBelow(std::size_t place) const
    {
        const auto count = static_cast<std::ptrdiff_t>(m_size > place ? m_size - 1 - place : 0);
        return std::any_of(m_words.begin(), m_words.begin() + count,
                           [](std::uint32_t word) { return word != 0; });
    }

private:
    /// The most that is needed: a dividend for 5^1091, which has 2534 bits, and a quotient of three
    /// words. 769 digits are 2555 bits.
    std::array<std::uint32_t, 96> m_words;
    /// How many words are in use. The last of them is not 0.
    std::size_t m_size = 0;
};

/// 5^13 is the highest power of five that a word has room for.
constexpr int kFivesAtOnce = 13;

/// 5^power, but not more than 5^kFivesAtOnce.
std::uint32_t PowerOfFive(std::int64_t power)
{
    static constexpr auto powers = [] {
        std::array<std::uint32_t, kFivesAtOnce + 1> values{1};
        for (std::size_t i = 1; i < values.size(); ++i)
            values[i] = values[i - 1] * 5;
        return values;
    }();
    return powers[static_cast<std::size_t>(std::min<std::int64_t>(power, kFivesAtOnce))];
}

/// The double nearest to (word + rest) x 2^exponent, where the highest bit of `word` is set and the
/// rest is 0 or, with `more`, between 0 and 1.
double RoundToDouble(std::uint64_t word, bool more, int exponent)
{
    const int biased = exponent + 63 + kExponentBias;
    if (biased > 2 * kExponentBias)
        return std::numeric_limits<double>::infinity();
    // A double has no room for the lowest bits. A subnormal one has less.
    const int places = 63 - kFractionBits + std::max(1 - biased, 0);
    if (places > 64)
        return 0.0;
    const auto half = std::uint64_t{1} << (places - 1);
    const auto rest = word & (half | (half - 1));
    const auto significand = word >> (places - 1) >> 1;
    const bool up = rest > half || (rest == half && (more || significand % 2 != 0));
    // The highest bit of a normal significand adds 1 to the exponent, and rounding up may carry.
    return std::bit_cast<double>(
        (static_cast<std::uint64_t>(std::max(biased, 1) - 1) << kFractionBits) + significand +
        (up ? 1 : 0));
}

/// Stores the double nearest to `decimal` and returns true; false where 128 bits of the product do
/// not tell, or for a power of ten that is not in the table.
bool ByOneProduct(Decimal decimal, double& value)
{
    if (decimal.digits == 0 || decimal.exponent < kMinPower || decimal.exponent > kMaxPower)
        return false;
    const auto& power = kPowers[PowerIndex(decimal.exponent)];
    const int zeros = std::countl_zero(decimal.digits);
    const auto w = decimal.digits << zeros;
    const auto [high, low] = UpperProduct(w, power);
    // The highest bit of the product is that of `high`, or the next one.
    const int shift = std::countl_zero(high);
    const auto word = high << shift | (shift == 0 ? 0 : low >> 63);
    // The exact product lies in [H, H + 2): what is below `word` is neither 0 nor carries into it.
    constexpr std::uint64_t uncertain = 4;
    const auto below = low << shift;
    if (below == 0 || below + uncertain < uncertain)
        return false;
    value = RoundToDouble(word, true, Exponent2(decimal.exponent) + 1 - zeros - shift);
    return true;
}

} // namespace

double NearestDouble(std::string_view digits, std::int64_t exponent) noexcept
{
    digits.remove_prefix(std::min(digits.find_first_not_of('0'), digits.size()));
    const auto magnitude = exponent + static_cast<std::int64_t>(digits.size());
    if (digits.empty() || magnitude < -323) // The smallest double is almost 5e-324.
        return 0.0;
    if (magnitude > 309)
        return std::numeric_limits<double>::infinity();

    // The number is digits x 5^exponent x 2^exponent.
    BigInteger number;
    for (constexpr std::size_t atOnce = 9; !digits.empty();) {
        std::uint32_t factor = 1;
        std::uint32_t value = 0;
        for (const char digit : digits.substr(0, atOnce)) {
            factor *= 10;
            value = value * 10 + static_cast<std::uint32_t>(digit - '0');
        }
        number.MultiplyAndAdd(factor, value);
        digits.remove_prefix(std::min(atOnce, digits.size()));
    }
    for (auto power = exponent; power > 0; power -= kFivesAtOnce)
        number.MultiplyAndAdd(PowerOfFive(power), 0);
    std::size_t added = 0;
    bool more = false;
    if (exponent < 0) {
        // As many as leave a quotient of at least three words. log2(5) is less than 2.322.
        const auto size = static_cast<std::size_t>(-exponent) * 2'322 / 1'000 / kWordBits + 4;
        added = std::max(size, number.Size()) - number.Size();
        number.ShiftUp(added);
        // Rounding down after each division gives the same quotient as rounding down once.
        for (auto power = -exponent; power > 0; power -= kFivesAtOnce)
            more = number.Divide(PowerOfFive(power)) || more;
    }

    const auto top = number.FromTop(0) << kWordBits | number.FromTop(1);
    const auto next = number.FromTop(2) << kWordBits;
    const int zeros = std::countl_zero(top);
    const auto word = zeros == 0 ? top : top << zeros | next >> (64 - zeros);
    more = more || next << zeros != 0 || number.AnyBelow(2);
    const auto words = static_cast<int>(number.Size()) - 2 - static_cast<int>(added);
    return RoundToDouble(word, more, static_cast<int>(exponent) + kWordBits * words - zeros);
}

double NearestDouble(Decimal decimal) noexcept
{
    if (double value = 0.0; ByOneProduct(decimal, value))
        return value;
    std::array<char, std::numeric_limits<std::uint64_t>::digits10 + 1> text;
    auto* const end = std::to_chars(text.data(), text.data() + text.size(), decimal.digits).ptr;
    return NearestDouble({text.data(), static_cast<std::size_t>(end - text.data())},
                         decimal.exponent);
}

double ExactDecimal::Value(std::int64_t exponent) noexcept
{
    exponent += m_exponent;
    // The first digits often tell: when the number's two neighbours of so many digits round alike.
    constexpr std::size_t first = 19;
    if (m_count > first && std::abs(exponent) < 2'000) {
        Decimal lower{0, static_cast<int>(exponent) + static_cast<int>(m_count - first)};
        std::from_chars(m_digits.data(), m_digits.data() + first, lower.digits);
        double value = 0.0;
        double next = 0.0;
        if (ByOneProduct(lower, value) && ByOneProduct({lower.digits + 1, lower.exponent}, next) &&
            value == next)
            return value;
    }
    if (m_more) { // One digit stands for all that were left out: it is not zero, that is enough.
        m_digits[m_count++] = '1';
        --exponent;
    }
    return NearestDouble({m_digits.data(), m_count}, exponent);
}

} // namespace dcm
