#include "dcm/elements/decimal.h"

#include <array>
#include <bit>
#include <charconv>
#include <cstddef>
#include <limits>

namespace dcm {
namespace {

/// The significand of a power of ten: words from low to high, the highest bit set. Each step rounds
/// down, by less than one unit of the lowest word, so that after 342 steps the exact significand is
/// less than 2 x 342 units above.
class Significand
{
public:
    /// Multiplies by ten, as 5/4 or 5/8.
    constexpr void TimesTen()
    {
        std::uint64_t carry = 0;
        for (auto& word : m_words) {
            carry += std::uint64_t{word} * 5;
            word = static_cast<std::uint32_t>(carry);
            carry >>= kWordBits;
        }
        ShiftIn(carry);
    }

    /// Divides by ten, as 4/5 or 8/5: the quotient by 5, from one word below the lowest.
    constexpr void OverTen()
    {
        const auto top = m_words.back() / 5;
        std::uint64_t rest = m_words.back() % 5;
        for (std::size_t i = m_words.size(); i-- > 0;) {
            rest = rest << kWordBits | (i > 0 ? m_words[i - 1] : 0);
            m_words[i] = static_cast<std::uint32_t>(rest / 5);
            rest %= 5;
        }
        ShiftIn(top);
    }

    constexpr Power Upper() const
    {
        if (m_words[1] == std::numeric_limits<std::uint32_t>::max())
            throw "a carry into the upper words could be lost"; // Stops the compiler.
        return {Pair(4), Pair(2)};
    }

private:
    constexpr std::uint64_t Pair(std::size_t i) const
    {
        return std::uint64_t{m_words[i + 1]} << kWordBits | m_words[i];
    }

    /// Shifts `top`, which is not 0, into the words from above, down to its highest bit.
    constexpr void ShiftIn(std::uint64_t top)
    {
        const auto bits = static_cast<int>(std::bit_width(top));
        for (std::size_t i = 0; i < m_words.size(); ++i) {
            const auto above = i + 1 < m_words.size() ? m_words[i + 1] : top;
            m_words[i] = static_cast<std::uint32_t>((above << kWordBits | m_words[i]) >> bits);
        }
    }

    static constexpr int kWordBits = 32;
    std::array<std::uint32_t, 6> m_words{0, 0, 0, 0, 0, 0x8000'0000};
};

constexpr auto MakePowers()
{
    std::array<Power, kMaxPower - kMinPower + 1> powers{};
    Significand up;
    for (int power = 0; power <= kMaxPower; ++power, up.TimesTen())
        powers[PowerIndex(power)] = up.Upper();
    Significand down;
    for (int power = 0; power >= kMinPower; --power, down.OverTen())
        powers[PowerIndex(power)] = down.Upper();
    return powers;
}

constexpr auto MakePowerBits()
{
    std::array<std::uint64_t, kMaxNormalPower - kMinNormalPower + 1> bits{};
    for (int power = kMinNormalPower; power <= kMaxNormalPower; ++power) {
        const auto& [high, low] = kPowers[PowerIndex(power)];
        constexpr int places = 63 - kFractionBits;
        constexpr auto lost = (std::uint64_t{1} << places) - 1;
        // The highest bit of the significand adds 1 to the exponent.
        const auto biased = static_cast<std::uint64_t>(Exponent2(power) + kExponentBias - 1);
        bits[static_cast<std::size_t>(power - kMinNormalPower)] =
            (biased << kFractionBits) + (high >> places) + ((high & lost) != 0 || low != 0 ? 1 : 0);
    }
    return bits;
}

} // namespace

constexpr std::array<Power, kMaxPower - kMinPower + 1> kPowers = MakePowers();
constexpr std::array<std::uint64_t, kMaxNormalPower - kMinNormalPower + 1> kPowerBits =
    MakePowerBits();

Decimal ToDecimalExactly(double value, int count) noexcept
{
    std::array<char, 32> text; // d.ddde+xx
    auto* const end = std::to_chars(text.data(), text.data() + text.size(), value,
                                    std::chars_format::scientific, count - 1)
                          .ptr;
    text[1] = text[0];
    Decimal decimal{0, 0};
    const auto* const letter = std::from_chars(text.data() + 1, end, decimal.digits).ptr;
    std::from_chars(letter[1] == '+' ? letter + 2 : letter + 1, end, decimal.exponent);
    decimal.exponent -= count - 1;
    return decimal;
}

} // namespace dcm
