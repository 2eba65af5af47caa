#include "tools/number_text.h"

#include <bit>
#include <cfloat>
#include <charconv>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <limits>
#include <locale>
#include <optional>
#include <sstream>
#include <string>
#include <string_view>
#include <system_error>

namespace dcm::tools {

namespace {

constexpr std::uint64_t kUsualNan = 0x7FF8000000000000;
constexpr std::string_view kInfinity = "inf";
constexpr std::string_view kNanWithBits = "nan:";
constexpr std::size_t kDigits = 16;

std::string NanText(double number)
{
    const auto bits = std::bit_cast<std::uint64_t>(number);
    if (bits == kUsualNan)
        return "nan";
    char digits[kDigits];
    auto* const end = std::to_chars(digits, std::end(digits), bits, 16).ptr;
    std::string text(kNanWithBits);
    text.append(kDigits - static_cast<std::size_t>(end - digits), '0');
    return text.append(digits, end);
}

std::optional<double> NanOf(std::string_view digits)
{
    std::uint64_t bits = 0;
    const auto* const end = digits.data() + digits.size();
    const auto [stop, error] = std::from_chars(digits.data(), end, bits, 16);
    const auto number = std::bit_cast<double>(bits);
    if (digits.size() != kDigits || stop != end || error != std::errc() || !std::isnan(number))
        return std::nullopt;
    return number;
}

/// The finite number that the whole of a text is in decimal notation.
template <class Number = double>
std::optional<Number> DecimalOf(std::string_view text)
{
    Number number = 0;
    const char* const end = text.data() + text.size();
    // Not every standard library has it for doubles. Where registers are wider than a double, some
    // round twice.
    if constexpr (FLT_EVAL_METHOD == 0 && requires { std::from_chars(end, end, number); }) {
        const auto [stop, error] = std::from_chars(text.data(), end, number);
        if (stop != end || error != std::errc())
            return std::nullopt;
    } else {
        // A stream takes blanks, a plus sign and hexadecimal digits too, has zero for what is too
        // small, and fails at the smallest numbers although it reads them.
        if (text.empty() || text[0] == '+' ||
            text.find_first_not_of("0123456789.+-eE") != text.npos)
            return std::nullopt;
        std::istringstream stream{std::string(text)};
        stream.imbue(std::locale::classic());
        stream >> number;
        const bool isZero =
            text.substr(0, text.find_first_of("eE")).find_first_of("123456789") == text.npos;
        const bool isTiny = std::abs(number) < 1 && number != 0;
        if (isZero != (number == 0) || (stream.fail() && !isTiny) ||
            stream.rdbuf()->in_avail() != 0)
            return std::nullopt;
    }
    return std::isfinite(number) ? std::optional(number) : std::nullopt;
}

} // namespace

std::string NumberText(double number)
{
    if (std::isnan(number))
        return NanText(number);
    char digits[32];
    return {digits, std::to_chars(digits, std::end(digits), number).ptr};
}

std::string ShortNumberText(double number)
{
    constexpr int kShortDigits = 6;
    char digits[32];
    auto* const end =
        std::to_chars(digits, std::end(digits), number, std::chars_format::general, kShortDigits)
            .ptr;
    return {digits, end};
}

std::optional<double> NumberOf(std::string_view text)
{
    if (text == "nan")
        return std::bit_cast<double>(kUsualNan);
    if (text.starts_with(kNanWithBits))
        return NanOf(text.substr(kNanWithBits.size()));
    if (text == kInfinity)
        return std::numeric_limits<double>::infinity();
    if (text.starts_with('-') && text.substr(1) == kInfinity)
        return -std::numeric_limits<double>::infinity();
    return DecimalOf(text);
}

} // namespace dcm::tools
