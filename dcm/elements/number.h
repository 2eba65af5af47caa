#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
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
char* WriteNumber(double value, int digits, char* to) noexcept;

/// The number at the start of `text`, behind white space: its longest prefix that is a decimal
/// number, rounded to nearest, ties to even; too large a number is infinity. Without a number +0.0,
/// also behind a sign.
double ReadDecimal(std::string_view text) noexcept;

/// The value of a whole token: infinity for "1.#Inf" and "-1.#Inf" in letters of either case, else
/// what ReadDecimal reads.
double ReadNumber(std::string_view token) noexcept;

/// As many numbers as it pays to read in one go.
inline constexpr std::size_t kNumbersAtOnce = 16;

/// Reads the numbers of a text in which blanks part them.
class NumberReader
{
public:
    /// The text must outlive the reader. `kReadAhead` characters behind it must be there to be
    /// read, and the first must be none that a number could go on with: texts of a file are cut in
    /// front of white space, a quote or a zero.
    explicit NumberReader(std::string_view text) noexcept
        : m_at(text.empty() ? nullptr : text.data()), m_end(text.data() + text.size())
    {}

    /// Reads the next numbers, as many as there is room for, and returns how many; fewer when the
    /// text is used up. Each is the value that ReadNumber finds for the token in front of the next
    /// blank, or for all that is left; the white space behind that blank does not count. Behind
    /// the last blank there is a token even if nothing follows. A text of nothing has no number.
    std::size_t Next(std::span<double> values) noexcept;

private:
    double NextOfAnyKind(const char*& at) const;

    /// The next token, or null when there is none.
    const char* m_at;
    const char* m_end;
};

/// The decimal integer at the start of `text`: white space, a sign, digits; what follows is
/// ignored. Saturates at the limits of 32 bits; 0 without digits.
std::int32_t ReadInteger(std::string_view text) noexcept;

} // namespace dcm
