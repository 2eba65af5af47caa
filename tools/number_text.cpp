#include "tools/number_text.h"

#include <bit>
#include <charconv>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <optional>
#include <string>
#include <string_view>
#include <system_error>

namespace dcm::tools {

namespace {

constexpr std::uint64_t kUsualNan = 0x7FF8000000000000;
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
    double number = 0.0;
    const auto* const end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data(), end, number);
    // What is left are other spellings of not-a-number.
    if (text.empty() || stop != end || error != std::errc() || std::isnan(number))
        return std::nullopt;
    return number;
}

} // namespace dcm::tools
