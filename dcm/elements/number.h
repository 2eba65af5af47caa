#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

namespace dcm {

/// Room that WriteNumber needs, in characters.
inline constexpr std::size_t kNumberTextMax = 32;

/// Significant digits that bring every number back, and those of a two-dimensional value block.
inline constexpr int kFullDigits = 17;
inline constexpr int kShortDigits = 15;

/// Writes a blank and `value`, rounded to `digits` (17 or 15) significant digits, at `to`, where
/// there must be room for kNumberTextMax characters. Zeros at the end are left out; ".0" follows an
/// integer. Below 1e-4, and from 10 to the power of `digits`, the notation is that with an
/// exponent, which has at least three digits. Infinities and not-a-numbers have names: "1.#INF",
/// "1.#QNAN",
/// "-1.#IND", "1.#SNAN". Returns the end of the text. There is no terminator, and characters after
/// the end may be overwritten.
char* WriteNumber(double value, int digits, char* to) noexcept;

/// The number at the start of `text`, after white space: the longest prefix that is a decimal
/// number, rounded to the nearest double, ties to even. Too large a number becomes infinity.
/// Without a number the result is +0.0, also after a minus sign.
double ReadDecimal(std::string_view text) noexcept;

/// The value of a whole token: infinity for "1.#Inf" and "-1.#Inf" in letters of either case, else
/// what ReadDecimal reads.
double ReadNumber(std::string_view token) noexcept;

/// What is wrong with a token.
enum class NumberFault : unsigned char
{
    kNone,
    /// There is no number; 0 is read.
    kUnreadable,
    /// A number, and more text after it.
    kCut,
    /// A number too large for a double; infinity is read.
    kOutOfRange,
    /// The name of a not-a-number, of which only the leading 1 is read.
    kNotANumber,
};

/// What is wrong with a token whose number is `value`.
NumberFault FaultOf(std::string_view token, double value) noexcept;

class BlockReport;

/// Reads the numbers of a text in which they are separated by blanks, and appends them to
/// `numbers`, whose items are doubles or variants. Each is what ReadNumber returns for the token
/// before the next blank, or for the rest of the text; white space after that blank is skipped.
/// After the last blank there is a token even if nothing follows. An empty text has no number.
///
/// `kReadAhead` characters after the text must be readable, and a number must not be able to go on
/// with the first of them: texts of a file end before white space, a quote or a zero. Tokens that
/// are no plain number are reported to `report`, if that is not null. When memory runs out, the
/// numbers before that have been appended.
template <class Number>
void ReadNumbers(std::string_view text, BlockReport* report, std::vector<Number>& numbers);

/// The decimal integer at the start of `text`: white space, a sign, digits; what follows is
/// ignored. Saturates at the limits of 32 bits; 0 without digits.
std::int32_t ReadInteger(std::string_view text) noexcept;

} // namespace dcm
