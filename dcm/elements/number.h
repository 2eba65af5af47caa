#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace dcm {

/// Room that WriteNumber needs, in characters.
inline constexpr std::size_t kNumberTextMax = 32;

/// Significant digits that bring every number back, and those of a two-dimensional value block.
inline constexpr int kFullDigits = 17;
inline constexpr int kShortDigits = 15;

/// Writes `value` with `digits` (17 or 15) significant digits at `to`: a blank, then the shortest
/// of these digits in fixed notation, or in exponent notation (at least three digits of exponent)
/// below 1e-4 and from 10 to the power of `digits`; ".0" follows an integer. Infinities and
/// not-a-numbers have names: "1.#INF", "1.#QNAN", "-1.#IND", "1.#SNAN". Returns the text's end; no
/// terminator. Characters behind the end, up to kNumberTextMax, may be overwritten.
wchar_t* WriteNumber(double value, int digits, wchar_t* to) noexcept;

/// The number at the start of `text`, behind white space: its longest prefix that is a decimal
/// number, rounded to nearest, ties to even; too large a number is infinity. Without a number +0.0,
/// also behind a sign.
double ReadDecimal(std::wstring_view text) noexcept;

/// The value of a whole token: infinity for "1.#Inf" and "-1.#Inf" in letters of either case, else
/// what ReadDecimal reads.
double ReadNumber(std::wstring_view token) noexcept;

/// Reads the token in front of the first blank of `rest` (all of it without a blank) as ReadNumber
/// does, then removes it, that blank and the white space behind it from `rest`. Returns whether a
/// blank ended the token, so that another token follows.
bool TakeNumber(std::wstring_view& rest, double& value) noexcept;

/// The decimal integer at the start of `text`: white space, a sign, digits; what follows is
/// ignored. Saturates at the limits of 32 bits; 0 without digits.
std::int32_t ReadInteger(std::wstring_view text) noexcept;

} // namespace dcm
