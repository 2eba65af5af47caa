// Numbers are written as the standard library writes them and read as the C library reads them in
// the C locale, except for the forms that only this format has.

#include "fuzz/target.h"
#include "tests/number_check.h"

#include <algorithm>
#include <cstring>

namespace {

/// What the C library reads of those leading characters that a decimal number consists of.
double ReferenceNumber(std::string token)
{
    std::transform(token.begin(), token.end(), token.begin(),
                   [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c; });
    if (token == "1.#inf" || token == "-1.#inf")
        return std::copysign(std::numeric_limits<double>::infinity(), token[0] == '-' ? -1 : 1);
    token.resize(std::min(token.find_first_not_of("0123456789.+-e \t\n\v\f\r"), token.size()));
    return std::strtod(token.c_str(), nullptr);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const std::string text(reinterpret_cast<const char*>(data), size);
    // More text after it may be read at once.
    for (const char* tail : {"", "   \t 7.25       "}) {
        const std::string wrong = WrongLine(text + tail, ReferenceNumber);
        Require(wrong.empty(), wrong.c_str());
    }
    // The C library saturates at the limits of 64 bits.
    const long long integer = std::strtoll(text.c_str(), nullptr, 10);
    const auto expected = std::clamp<long long>(integer, std::numeric_limits<std::int32_t>::min(),
                                                std::numeric_limits<std::int32_t>::max());
    Require(dcm::ReadInteger(text) == expected, "the integer read");
    for (std::size_t at = 0; at + sizeof(double) <= std::min<std::size_t>(size, 32); at += 4) {
        double value = 0;
        std::memcpy(&value, data + at, sizeof value);
        const std::string wrong = std::isfinite(value) ? WrongText(value) : "";
        Require(wrong.empty(), wrong.c_str());
    }
    return 0;
}
