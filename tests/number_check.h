#pragma once

#include "dcm/elements/number.h"
#include "dcm/platform/word.h"

#include <algorithm>
#include <bit>
#include <cfloat>
#include <charconv>
#include <clocale>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <iomanip>
#include <limits>
#include <locale>
#include <random>
#include <sstream>
#include <string>
#include <string_view>
#include <system_error>
#include <vector>

/// Numbers and number texts of every kind from a seed: of few and of many digits, of any size,
/// round ones, and those that are hard to round.
class NumberSource
{
public:
    explicit NumberSource(std::uint64_t seed) : m_random(seed) {}

    /// A finite number.
    double Number()
    {
        const std::uint64_t bits = m_random() >> (Below(4) == 0 ? Below(64) : 0); // denormals too
        const std::uint64_t low = (std::uint64_t{1} << Below(53)) - 1;
        const double numbers[] = {std::bit_cast<double>(bits), std::bit_cast<double>(bits & ~low),
                                  std::bit_cast<double>(bits | low), Parse(DecimalText())};
        const double number = numbers[Below(4)];
        return std::isfinite(number) ? number : 0.5;
    }

    /// A text that is a decimal number as a whole.
    std::string Text()
    {
        if (Below(4) != 0)
            return DecimalText();
        // Halfway between two numbers, or a little above.
        const std::string digits = Halfway(Number());
        return digits.substr(0, digits.find('e')) + "01"[Below(2)] +
               digits.substr(digits.find('e'));
    }

    /// What the standard library reads, with infinity and zero for what is out of range.
    static double Parse(const std::string& text)
    {
        double value = 0;
        if (ParseAtOnce(text.data(), text.data() + text.size(), value))
            return value;
        std::string local = text;
        if (const auto point = local.find('.'); point != local.npos)
            local.replace(point, 1, std::localeconv()->decimal_point);
        return std::strtod(local.c_str(), nullptr);
    }

    /// Whether `Parse` gives the nearest numbers: the C library of 32-bit Windows does not.
    static bool ParsesExactly() { return Parse(Halfway(0x7FFp-1074)) == 0x1p-1063; }

private:
    /// Uses `from_chars`; false for numbers out of range, where the standard library has none for
    /// doubles, and where registers are wider than a double, because libstdc++ rounds twice there.
    template <class Value>
    static bool ParseAtOnce(const char* begin, const char* end, Value& value)
    {
        if constexpr (FLT_EVAL_METHOD == 0 && requires { std::from_chars(begin, end, value); })
            return std::from_chars(begin, end, value).ec == std::errc();
        return false;
    }
    /// All digits of the number halfway between one and the next.
    static std::string Halfway(double number)
    {
        const double next = std::nextafter(number, std::numeric_limits<double>::max());
        std::ostringstream text;
        text.imbue(std::locale::classic());
        text << std::scientific << std::setprecision(779)
             << static_cast<long double>(number) / 2 + static_cast<long double>(next) / 2;
        return text.str();
    }
    std::size_t Below(std::size_t limit) { return static_cast<std::size_t>(m_random() % limit); }
    std::string DecimalText()
    {
        const std::string_view digits = Below(2) == 0 ? "0123456789" : "0009999995";
        std::string text = "-.";
        for (std::size_t i = 1 + Below(Below(4) == 0 ? 400 : 24); i > 0; --i)
            text += digits[Below(10)];
        std::swap(text[1], text[1 + Below(text.size() - 2)]);
        const int exponent = static_cast<int>(Below(800)) - 400;
        return text.substr(Below(2)) + (Below(2) == 0 ? "" : 'e' + std::to_string(exponent));
    }

    std::mt19937_64 m_random;
};

/// What is written for a number, with the blank before it.
inline std::string Text(double number, int digits)
{
    std::string text(dcm::kNumberTextMax + 1, 'x');
    const char* const end = dcm::WriteNumber(number, digits, text.data());
    if (text.back() != 'x')
        return "more than its room";
    return {static_cast<const char*>(text.data()), end};
}

/// What is wrong with how the numbers of a line are read, each alone and among the others; empty if
/// nothing is. `expected` tells the number of a token.
template <class Expected>
std::string WrongLine(const std::string& line, Expected expected)
{
    const std::string text = line + "\"5.5e5.5"; // What follows the line must not count.
    static_assert(dcm::kReadAhead == 8);
    std::vector<double> numbers;
    dcm::ReadNumbers({text.data(), line.size()}, nullptr, numbers);
    std::size_t count = 0;
    for (std::size_t start = 0, blank = 0; !line.empty() && blank < line.size(); ++count) {
        if (count == numbers.size())
            return "no number for" + line.substr(start);
        blank = std::min(line.find(' ', start), line.size());
        const std::string token = line.substr(start, blank - start);
        const double right = expected(token);
        for (const double number : {numbers[count], dcm::ReadNumber(token)})
            if (std::bit_cast<std::uint64_t>(number) != std::bit_cast<std::uint64_t>(right))
                return token + " is " + std::to_string(number);
        start = std::min(line.find_first_not_of(" \t\n\v\f\r", blank), line.size());
    }
    return count == numbers.size() ? "" : "a number more than tokens";
}

/// What is wrong with how `token` is read in lines where it is the first or only one.
inline std::string WrongNumber(const std::string& token, double expected)
{
    std::string wrong;
    for (const char* tail : {"", " ", "   \t 7.25       "})
        wrong += WrongLine(token + tail, [&](const std::string& found) {
            return found == token ? expected : found.empty() ? 0 : 7.25;
        });
    return wrong;
}

/// How the text of a finite number differs from what the standard library writes; empty if it does
/// not.
inline std::string WrongText(double number)
{
    for (const int digits : {dcm::kFullDigits, dcm::kShortDigits}) {
        std::ostringstream stream;
        stream.imbue(std::locale::classic());
        stream << ' ' << std::setprecision(digits) << number;
        std::string expected = stream.str();
        const auto letter = expected.find('e');
        if (letter != expected.npos)
            expected.insert(letter + 2, expected.size() - letter == 4 ? 1 : 0, '0');
        else if (expected.find('.') == expected.npos)
            expected += ".0";
        if (const std::string text = Text(number, digits); text != expected)
            return "not" + expected + " but" + text;
    }
    return WrongNumber(Text(number, dcm::kFullDigits).substr(1), number);
}
