#include "dcm/elements/number.h"

#include <algorithm>
#include <array>
#include <bit>
#include <charconv>
#include <cmath>
#include <limits>
#include <system_error>

namespace dcm {
namespace {

constexpr bool IsDigit(wchar_t c)
{
    return c >= L'0' && c <= L'9';
}

constexpr bool IsWhiteSpace(wchar_t c)
{
    return c == L' ' || (c >= L'\t' && c <= L'\r');
}

void SkipWhiteSpace(std::wstring_view& text)
{
    std::size_t n = 0;
    while (n < text.size() && IsWhiteSpace(text[n])) {
        ++n;
    }
    text.remove_prefix(n);
}

/// Takes a sign off the front of `text`; returns whether it was a minus sign.
bool TakeSign(std::wstring_view& text)
{
    const bool negative = text.starts_with(L'-');
    if (negative || text.starts_with(L'+')) {
        text.remove_prefix(1);
    }
    return negative;
}

/// Whether `text` is "1.#Inf" in letters of either case.
bool IsInfinityName(std::wstring_view text)
{
    constexpr std::wstring_view lower = L"1.#inf";
    return std::equal(text.begin(), text.end(), lower.begin(), lower.end(), [](auto c, auto want) {
        return c == want || (c >= L'A' && c <= L'Z' && c - L'A' + L'a' == want);
    });
}

/// The name of an infinity or a not-a-number, without its sign.
std::wstring_view SpecialName(double value)
{
    constexpr std::uint64_t fractionMask = 0x000F'FFFF'FFFF'FFFF;
    constexpr std::uint64_t quietBit = 0x0008'0000'0000'0000;
    constexpr std::uint64_t defaultNotANumber = 0xFFF8'0000'0000'0000;
    const auto bits = std::bit_cast<std::uint64_t>(value);
    if ((bits & fractionMask) == 0) {
        return L"1.#INF";
    }
    if (bits == defaultNotANumber) {
        return L"1.#IND";
    }
    return (bits & quietBit) != 0 ? L"1.#QNAN" : L"1.#SNAN";
}

/// A number's significant digits, without leading zeros, and the power of ten of the last one.
class ExactDecimal
{
public:
    void Append(wchar_t digit, bool behindPoint)
    {
        if (m_count == 0 && digit == L'0') {
            m_exponent -= behindPoint ? 1 : 0;
        } else if (m_count < kDigitsMax) {
            m_text[m_count++] = static_cast<char>(digit);
            m_exponent -= behindPoint ? 1 : 0;
        } else {
            m_more = m_more || digit != L'0';
            m_exponent += behindPoint ? 0 : 1;
        }
    }

    /// The magnitude times 10 to the power of `exponent`.
    double Value(std::int64_t exponent)
    {
        if (m_count == 0) {
            return 0.0;
        }
        exponent += m_exponent;
        const auto magnitude = exponent + static_cast<std::int64_t>(m_count);
        if (magnitude > 400) {
            return std::numeric_limits<double>::infinity();
        }
        if (magnitude < -400) {
            return 0.0;
        }
        if (m_more) { // One digit stands for all that were left out: not zero, that is enough.
            m_text[m_count++] = '1';
            --exponent;
        }
        char* const begin = m_text.data();
        char* end = begin + m_count;
        *end++ = 'e';
        end = std::to_chars(end, begin + m_text.size(), exponent).ptr;
        double value = 0.0;
        if (std::from_chars(begin, end, value).ec == std::errc::result_out_of_range) {
            return magnitude > 0 ? std::numeric_limits<double>::infinity() : 0.0;
        }
        return value;
    }

private:
    /// No double, and no point halfway between two, has more significant digits than 767.
    static constexpr std::size_t kDigitsMax = 768;

    std::array<char, kDigitsMax + 32> m_text;
    std::size_t m_count = 0;
    std::int64_t m_exponent = 0;
    bool m_more = false;
};

/// The exponent at the start of `text`, "e" included; 0 when there is none.
std::int64_t Exponent(std::wstring_view text)
{
    if (!text.starts_with(L'e') && !text.starts_with(L'E')) {
        return 0;
    }
    text.remove_prefix(1);
    const bool negative = TakeSign(text);
    std::int64_t exponent = 0;
    for (std::size_t i = 0; i < text.size() && IsDigit(text[i]); ++i) {
        // More than any count of digits can make up for, and far from overflow.
        constexpr std::int64_t enough = 100'000'000'000'000'000;
        exponent = std::min(exponent * 10 + (text[i] - L'0'), enough);
    }
    return negative ? -exponent : exponent;
}

} // namespace

wchar_t* WriteNumber(double value, int digits, wchar_t* to) noexcept
{
    *to++ = L' ';
    if (!std::isfinite(value)) {
        if (std::signbit(value)) {
            *to++ = L'-';
        }
        return std::ranges::copy(SpecialName(value), to).out;
    }
    std::array<char, kNumberTextMax> text;
    const auto begin = text.begin();
    const auto end = std::next(begin, std::to_chars(text.data(), text.data() + text.size(), value,
                                                    std::chars_format::general, digits)
                                              .ptr -
                                          text.data());
    const auto letter = std::find(begin, end, 'e');
    to = std::copy(begin, letter, to);
    if (letter != end) {
        to = std::copy(letter, letter + 2, to);
        if (end - letter == 4) {
            *to++ = L'0';
        }
        return std::copy(letter + 2, end, to);
    }
    if (std::find(begin, end, '.') == end) {
        *to++ = L'.';
        *to++ = L'0';
    }
    return to;
}

double ReadNumber(std::wstring_view token) noexcept
{
    constexpr double infinity = std::numeric_limits<double>::infinity();
    if (IsInfinityName(token)) {
        return infinity;
    }
    if (token.starts_with(L'-') && IsInfinityName(token.substr(1))) {
        return -infinity;
    }
    SkipWhiteSpace(token);
    const bool negative = TakeSign(token);
    ExactDecimal decimal;
    bool point = false;
    std::size_t i = 0;
    for (; i < token.size(); ++i) {
        if (IsDigit(token[i])) {
            decimal.Append(token[i], point);
        } else if (token[i] == L'.' && !point) {
            point = true;
        } else {
            break;
        }
    }
    const bool found = i > (point ? 1 : 0);
    if (!found) {
        return 0.0;
    }
    const double value = decimal.Value(Exponent(token.substr(i)));
    return negative ? -value : value;
}

bool TakeNumber(std::wstring_view& rest, double& value) noexcept
{
    const auto blank = rest.find(L' ');
    value = ReadNumber(rest.substr(0, blank));
    if (blank == rest.npos) {
        rest = {};
        return false;
    }
    rest.remove_prefix(blank);
    SkipWhiteSpace(rest);
    return true;
}

std::int32_t ReadInteger(std::wstring_view text) noexcept
{
    SkipWhiteSpace(text);
    const bool negative = TakeSign(text);
    constexpr std::int64_t limit = std::int64_t{1} << 31;
    std::int64_t value = 0;
    for (std::size_t i = 0; i < text.size() && IsDigit(text[i]); ++i) {
        value = std::min(value * 10 + (text[i] - L'0'), limit);
    }
    return static_cast<std::int32_t>(negative ? -value : std::min(value, limit - 1));
}

} // namespace dcm
