#pragma once

#include "dcm/elements/decimal.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

// The exact conversion from decimal digits to doubles, for numbers that decimal.h cannot tell. It
// works in integers alone, so that the rounding mode and registers wider than a double change
// nothing.
namespace dcm {

/// No double has more than 767 significant digits, and no point halfway between two doubles more
/// than 768. One digit more tells whether a number is above such a point.
inline constexpr std::size_t kExactDigitsMax = 769;

/// The double nearest to digits x 10^exponent, ties to even; infinity when that is too large.
/// `digits` are '0' to '9', at most kExactDigitsMax of them.
double NearestDouble(std::string_view digits, std::int64_t exponent) noexcept;

/// The same for a number of at most 64 bits.
double NearestDouble(Decimal decimal) noexcept;

/// A decimal number of any length, taken digit by digit.
class ExactDecimal
{
public:
    /// Adds the next digit, '0' to '9'.
    void Append(char digit, bool afterPoint) noexcept
    {
        if (m_count == 0 && digit == '0') {
            m_exponent -= afterPoint ? 1 : 0;
        } else if (m_count < kExactDigitsMax - 1) {
            m_digits[m_count++] = digit;
            m_exponent -= afterPoint ? 1 : 0;
        } else {
            m_more = m_more || digit != '0';
            m_exponent += afterPoint ? 0 : 1;
        }
    }

    /// The double nearest to the number times 10^exponent, ties to even; infinity when that is too
    /// large.
    double Value(std::int64_t exponent) noexcept;

private:
    /// The significant digits, without leading zeros, and the power of ten of the last one.
    std::array<char, kExactDigitsMax> m_digits;
    std::size_t m_count = 0;
    std::int64_t m_exponent = 0;
    /// Whether a digit that is not 0 was left out.
    bool m_more = false;
};

} // namespace dcm
