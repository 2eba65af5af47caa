#pragma once

#include <array>
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
double ReadDecimal(std::string_view text) noexcept;

/// The value of a whole token: infinity for "1.#Inf" and "-1.#Inf" in letters of either case, else
/// what ReadDecimal reads.
double ReadNumber(std::string_view token) noexcept;

/// Reads numbers one after the other from text in which blanks part them.
class NumberReader
{
public:
    explicit NumberReader(std::string_view text) noexcept { Load(text); }
    NumberReader(const NumberReader&) = delete;
    NumberReader& operator=(const NumberReader&) = delete;

    /// Reads the token in front of the next blank (all that is left, without a blank) as ReadNumber
    /// does, then skips that blank and the white space behind it. Returns whether a blank ended the
    /// token, so that another token follows.
    bool Next(double& value) noexcept;

    /// The text that is left.
    std::string_view Rest() const noexcept { return m_text.substr(Position()); }

private:
    /// Characters that are looked at together, and how many of them must be left for a number to be
    /// read from them.
    static constexpr std::size_t kPiece = 512;
    static constexpr std::size_t kLongest = 64;
    static constexpr std::size_t kBehind = 8;

    std::size_t Position() const { return static_cast<std::size_t>(m_at - m_piece.data()); }
    void Load(std::string_view text);
    void Skip(std::size_t count);
    void SkipWhite();
    bool NextOfAnyKind(double& value);

    /// A piece of `m_text`, from its start on, and zeros: digits are looked at eight at a time.
    std::array<unsigned char, kPiece + kBehind> m_piece;
    std::string_view m_text;
    const unsigned char* m_at;
    /// Where the piece ends, and behind which position a number may reach beyond that.
    const unsigned char* m_end;
    const unsigned char* m_last;
};

/// The decimal integer at the start of `text`: white space, a sign, digits; what follows is
/// ignored. Saturates at the limits of 32 bits; 0 without digits.
std::int32_t ReadInteger(std::string_view text) noexcept;

} // namespace dcm
