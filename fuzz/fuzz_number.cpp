// Numbers are written as the standard library does it and read as the C library does it in the C
// locale, but for the forms that the format has for itself.

#include "fuzz/number_check.h"
#include "fuzz/target.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <string>
#include <string_view>

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

void CheckReading(const std::string& text)
{
    dcm::NumberReader numbers(text);
    bool more = true;
    while (more) {
        const std::size_t start = text.size() - numbers.Rest().size();
        const std::size_t blank = std::min(text.find(' ', start), text.size());
        const std::string token = text.substr(start, blank - start);
        const double expected = ReferenceNumber(token);
        double taken = 1;
        more = numbers.Next(taken);
        const std::string wrong = WrongNumber(token, expected);
        Require(wrong.empty(), wrong.c_str());
        Require(std::bit_cast<std::uint64_t>(taken) == std::bit_cast<std::uint64_t>(expected),
                "the number taken");
        Require(more == (blank < text.size()), "another number follows");
        const std::size_t next =
            std::min(text.find_first_not_of(" \t\n\v\f\r", blank), text.size());
        Require(text.size() - numbers.Rest().size() == next, "where the next number begins");
    }
    // The C library saturates at 64 bits, far beyond the limits of 32.
    const long long integer = std::strtoll(text.c_str(), nullptr, 10);
    const auto expected = std::clamp<long long>(integer, std::numeric_limits<std::int32_t>::min(),
                                                std::numeric_limits<std::int32_t>::max());
    Require(dcm::ReadInteger(text) == expected, "the integer read");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    CheckReading(std::string(reinterpret_cast<const char*>(data), size));
    for (std::size_t at = 0; at + sizeof(double) <= std::min<std::size_t>(size, 32); at += 4) {
        double value = 0;
        std::memcpy(&value, data + at, sizeof value);
        const std::string wrong = std::isfinite(value) ? WrongText(value) : "";
        Require(wrong.empty(), wrong.c_str());
        Require(std::isfinite(value) ||
                    Text(value, 17).starts_with(std::signbit(value) ? " -1.#" : " 1.#"),
                "the name");
    }
    return 0;
}
