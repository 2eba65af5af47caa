#include "dcm/elements/decimal.h"

#include <array>
#include <bit>
#include <charconv>
#include <cstddef>
#include <limits>

namespace dcm {
namespace {

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
        if (m_word[2] > std::numeric_limits<std::uint64_t>::max() - std::uint64_t{2} * 342) {
            throw "a carry into the upper words could be lost"; // Stops the compiler.
        }
        return {m_word[0], m_word[1]};
    }

private:
    /// Shifts `top`, which is not 0, into the words from above, down to its highest bit.
    constexpr void Normalise(std::uint64_t top)
    {
        const int bits = 64 - std::countl_zero(top);
        for (auto& word : m_word) {
            const auto lower = word;
            // NOLINTNEXTLINE(clang-analyzer-core.UndefinedBinaryOperatorResult): `bits` is not 0.
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

} // namespace

constexpr std::array<Power, kMaxPower - kMinPower + 1> kPowers = MakePowers();

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

} // namespace dcm
