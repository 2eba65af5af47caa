#include "dcm/elements/decimal.h"

#include <array>
#include <bit>
#include <charconv>
#include <cstddef>
#include <limits>

namespace dcm {
namespace {

/// floor(log10(2^power)).
constexpr int Exponent10(int power)
{
    return (power * 1'262'611) >> 22;
}

/// The significand of a power of ten: words from high to low, the highest bit set. Each step rounds
/// down, by less than one unit of the last word, so that after 342 steps the exact significand is
/// less than 2 x 342 units above.
class Significand
{
public:
    /// Ten times as much, as 5/4 or 5/8.
    constexpr void TimesTen()
    {
        uint128 product = 0;
        for (std::size_t i = 3; i-- > 0;) {
            product = (product >> 64) + uint128{m_word[i]} * 5;
            m_word[i] = static_cast<std::uint64_t>(product);
        }
        Normalise(static_cast<std::uint64_t>(product >> 64));
    }

    /// A tenth, as 4/5 or 8/5: the quotient by 5 with 64 bits more, cut again.
    constexpr void OverTen()
    {
        const auto word = m_word;
        uint128 rest = word[0];
        const auto top = static_cast<std::uint64_t>(rest / 5);
        for (std::size_t i = 0; i < 3; ++i) {
            rest = ((rest % 5) << 64) | (i < 2 ? word[i + 1] : 0);
            m_word[i] = static_cast<std::uint64_t>(rest / 5);
        }
        Normalise(top);
    }

    constexpr Power Upper() const
    {
        if (m_word[2] > std::numeric_limits<std::uint64_t>::max() - 2 * 342) {
            throw "a carry into the upper words could be lost"; // Stops the compiler.
        }
        return {m_word[0], m_word[1]};
    }

private:
    /// Shifts `top` into the words from above, down to its highest bit.
    constexpr void Normalise(std::uint64_t top)
    {
        const int bits = 64 - std::countl_zero(top);
        for (auto& word : m_word) {
            const auto lower = word;
            word = (top << (64 - bits)) | (lower >> bits);
            top = lower;
        }
    }

    std::array<std::uint64_t, 3> m_word{std::uint64_t{1} << 63, 0, 0};
};

constexpr auto MakePowers()
{
    std::array<Power, kMaxPower - kMinPower + 1> powers{};
    Significand up;
    for (int power = 0; power <= kMaxPower; ++power, up.TimesTen()) {
        powers[PowerIndex(power)] = up.Upper();
    }
    Significand down;
    for (int power = 0; power >= kMinPower; --power, down.OverTen()) {
        powers[PowerIndex(power)] = down.Upper();
    }
    return powers;
}

/// ToDecimal for the numbers that the product leaves open.
Decimal ToDecimalExactly(double value, int count) noexcept
{
    std::array<char, 32> text; // d.ddde+xx
    const auto end = std::to_chars(text.data(), text.data() + text.size(), value,
                                   std::chars_format::scientific, count - 1)
                         .ptr;
    text[1] = text[0];
    Decimal decimal{0, 0};
    const auto letter = std::from_chars(text.data() + 1, end, decimal.digits).ptr;
    std::from_chars(letter[1] == '+' ? letter + 2 : letter + 1, end, decimal.exponent);
    decimal.exponent -= count - 1;
    return decimal;
}

} // namespace

constexpr std::array<Power, kMaxPower - kMinPower + 1> kPowers = MakePowers();

Decimal ToDecimal(double value, int count) noexcept
{
    // value = w x 2^exponent, the highest bit of w set.
    const auto bits = std::bit_cast<std::uint64_t>(value);
    const auto fraction = bits & ((std::uint64_t{1} << kFractionBits) - 1);
    const auto biased = static_cast<int>(bits >> kFractionBits);
    const auto whole = biased == 0 ? fraction : fraction | (std::uint64_t{1} << kFractionBits);
    const int zeros = std::countl_zero(whole);
    const auto w = whole << zeros;
    const int exponent = (biased == 0 ? 1 : biased) - kExponentBias - kFractionBits - zeros;

    // The first digit's power of ten: that of the power of two, or one more when the next power of
    // ten lies between that and the value.
    int first = Exponent10(exponent + 63);
    const auto& next = kPowers[PowerIndex(first + 1)];
    first += static_cast<int>(Exponent2(first + 1) == exponent + 63) &
             static_cast<int>(w >= next.high + (next.low != 0 ? 1 : 0));

    // H has `places` bits behind the point, besides its lower word.
    const int last = first - count + 1;
    const auto& power = kPowers[PowerIndex(-last)];
    const auto h = uint128{w} * power.high + ((uint128{w} * power.low) >> 64);
    const auto high = static_cast<std::uint64_t>(h >> 64);
    const auto low = static_cast<std::uint64_t>(h);
    const int places = -1 - exponent - Exponent2(-last);
    const auto half = std::uint64_t{1} << (places - 1);
    const auto behind = high & (2 * half - 1);
    if (low + 1 <= 1 && behind + 1 - half <= 1) {
        return ToDecimalExactly(value, count);
    }
    const auto digits = (high + half) >> places;
    const auto limit =
        std::uint64_t{count == 17 ? 100'000'000'000'000'000U : 1'000'000'000'000'000U};
    return digits == limit ? Decimal{limit / 10, last + 1} : Decimal{digits, last};
}

} // namespace dcm
