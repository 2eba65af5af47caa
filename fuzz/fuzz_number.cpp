// Numbers are written and read as the C library does it in the C locale, but for the forms that
// the format has for itself.

#include "dcm/elements/number.h"
#include "fuzz/target.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cmath>
#include <cstring>
#include <limits>
#include <string>
#include <string_view>

namespace {

/// The text of a finite number by the C library, exponents with three digits at least.
std::wstring ReferenceText(double value, int digits)
{
    std::array<char, 64> buffer{};
    std::snprintf(buffer.data(), buffer.size(), " %.*g", digits, value);
    std::string text = buffer.data();
    const std::size_t letter = text.find('e');
    if (letter != text.npos)
        text.insert(letter + 2, text.size() - letter == 4 ? 1 : 0, '0');
    else if (text.find('.') == text.npos)
        text += ".0";
    return {text.begin(), text.end()};
}

void CheckWriting(double value)
{
    for (const int digits : {17, 15}) {
        std::array<wchar_t, dcm::kNumberTextMax> buffer;
        const wchar_t* const end = dcm::WriteNumber(value, digits, buffer.data());
        const std::wstring text(static_cast<const wchar_t*>(buffer.data()), end);
        if (std::isfinite(value))
            Require(text == ReferenceText(value, digits), "the digits");
        else
            Require(text.starts_with(std::signbit(value) ? L" -1.#" : L" 1.#"), "the name");
        const double back = dcm::ReadNumber(text.substr(1));
        if (digits == 17 && !std::isnan(value))
            Require(std::bit_cast<std::uint64_t>(back) == std::bit_cast<std::uint64_t>(value),
                    "the number comes back");
    }
}

/// The longest decimal number at the start of `text`, without white space; empty if there is none.
std::string DecimalPrefix(std::string_view text)
{
    text.remove_prefix(std::min(text.find_first_not_of(" \t\n\v\f\r"), text.size()));
    std::size_t at = text.starts_with('-') || text.starts_with('+') ? 1 : 0;
    const auto skipDigits = [&] {
        const std::size_t start = at;
        at = std::min(text.find_first_not_of("0123456789", at), text.size());
        return at - start;
    };
    std::size_t digits = skipDigits();
    if (at < text.size() && text[at] == '.') {
        ++at;
        digits += skipDigits();
    }
    if (digits == 0)
        return {};
    const std::size_t mantissa = at;
    if (at < text.size() && (text[at] == 'e' || text[at] == 'E')) {
        ++at;
        at += at < text.size() && (text[at] == '-' || text[at] == '+') ? 1 : 0;
        at = skipDigits() > 0 ? at : mantissa;
    }
    return std::string(text.substr(0, at));
}

double ReferenceNumber(std::string token)
{
    const std::string number = DecimalPrefix(token);
    std::transform(token.begin(), token.end(), token.begin(),
                   [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c; });
    if (token == "1.#inf" || token == "-1.#inf")
        return token.starts_with('-') ? -std::numeric_limits<double>::infinity()
                                      : std::numeric_limits<double>::infinity();
    return number.empty() ? 0.0 : std::strtod(number.c_str(), nullptr);
}

void CheckReading(const std::string& text)
{
    // Beyond ASCII the characters become others that are no digits either.
    std::wstring wide(text.size(), L'\0');
    std::transform(text.begin(), text.end(), wide.begin(), [](char c) {
        return static_cast<wchar_t>(static_cast<unsigned char>(c) < 0x80 ? c : 0x660 + (c & 0x7F));
    });
    std::wstring_view rest = wide;
    bool more = true;
    while (more) {
        const std::size_t start = wide.size() - rest.size();
        const std::size_t blank = std::min(text.find(' ', start), text.size());
        const std::string token = text.substr(start, blank - start);
        const double expected = ReferenceNumber(token);
        double taken = 1;
        more = dcm::TakeNumber(rest, taken);
        const double read = dcm::ReadNumber(std::wstring_view(wide).substr(start, token.size()));
        Require(std::bit_cast<std::uint64_t>(read) == std::bit_cast<std::uint64_t>(expected),
                "the number read");
        Require(std::bit_cast<std::uint64_t>(taken) == std::bit_cast<std::uint64_t>(expected),
                "the number taken");
        Require(more == (blank < text.size()), "another number follows");
        const std::size_t next =
            std::min(text.find_first_not_of(" \t\n\v\f\r", blank), text.size());
        Require(wide.size() - rest.size() == next, "where the next number begins");
    }
    // The C library saturates at 64 bits, far beyond the limits of 32.
    const long long integer = std::strtoll(text.c_str(), nullptr, 10);
    const auto expected = std::clamp<long long>(integer, std::numeric_limits<std::int32_t>::min(),
                                                std::numeric_limits<std::int32_t>::max());
    Require(dcm::ReadInteger(wide) == expected, "the integer read");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    CheckReading(std::string(reinterpret_cast<const char*>(data), size));
    for (std::size_t at = 0; at + sizeof(double) <= std::min<std::size_t>(size, 32); at += 4) {
        double value = 0;
        std::memcpy(&value, data + at, sizeof value);
        CheckWriting(value);
    }
    return 0;
}
