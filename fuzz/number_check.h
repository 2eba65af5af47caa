#pragma once

#include "dcm/elements/number.h"

#include <array>
#include <bit>
#include <charconv>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <limits>
#include <locale>
#include <random>
#include <sstream>
#include <string>
#include <string_view>
#include <system_error>

/// Numbers and number texts of every kind from a seed: those that are frequent in files, and those
/// that are hard to round.
class NumberSource
{
public:
    explicit NumberSource(std::uint64_t seed) : m_random(seed) {}

    /// A finite number.
    double Number()
    {
        const double numbers[] = {
            std::bit_cast<double>(m_random()),
            static_cast<double>(Digits()) / std::pow(10, Below(20)), // short decimals
            std::ldexp(static_cast<double>(Digits()), -Below(64)),   // halves, quarters and on
            Neighbour(std::ldexp(1.0, Below(2098) - 1074)),
            Neighbour(Parse("1e" + std::to_string(Below(632) - 323))),
            std::bit_cast<double>(m_random() >> (12 + Below(52)))}; // denormals
        const double number = numbers[Below(6)];
        return !std::isfinite(number) ? 0.5 : Below(2) == 0 ? -number : number;
    }

    /// A text that is a decimal number as a whole.
    std::string Text()
    {
        std::array<char, 1600> buffer;
        char* const begin = buffer.data();
        char* const end = begin + buffer.size();
        const double number = Number();
        const int kind = Below(16);
        if (kind < 6)
            return {begin, std::to_chars(begin, end, number).ptr};
        if (kind < 12) {
            using enum std::chars_format;
            constexpr std::chars_format formats[] = {general, scientific, fixed};
            return {begin, std::to_chars(begin, end, number, formats[Below(3)], Below(25)).ptr};
        }
        if (kind == 12) { // half-way between two numbers, or a little above
            const auto next = std::nextafter(number, std::numeric_limits<double>::max());
            const auto half = (static_cast<long double>(number) + next) / 2;
            std::string text(
                begin, std::to_chars(begin, end, half, std::chars_format::scientific, 780).ptr);
            text[text.find('e') - 1] = "01"[Below(2)];
            return text;
        }
        std::string text;
        for (int i = 1 + Below(Below(4) == 0 ? 400 : 24); i > 0; --i)
            text += "0123456789"[Below(10)];
        text.insert(static_cast<std::size_t>(Below(static_cast<int>(text.size()))), ".");
        text = Below(2) == 0 ? text : text + 'e' + std::to_string(Below(800) - 400);
        return Below(2) == 0 ? text : '-' + text;
    }

    /// What the standard library reads, with infinity and zero for what is out of range.
    static double Parse(const std::string& text)
    {
        double value = 0;
        const auto error = std::from_chars(text.data(), text.data() + text.size(), value).ec;
        if (error == std::errc::result_out_of_range) {
            std::istringstream stream(text);
            stream.imbue(std::locale::classic());
            if (!(stream >> value)) // Too large: the largest number, with its sign.
                value *= std::numeric_limits<double>::infinity();
        }
        return value;
    }

private:
    int Below(int limit) { return static_cast<int>(m_random() % static_cast<unsigned>(limit)); }
    std::uint64_t Digits() { return m_random() >> (11 + Below(53)); }
    double Neighbour(double number)
    {
        return std::nextafter(number, Below(3) == 0 ? number : Below(2) * 2 * number);
    }

    std::mt19937_64 m_random;
};

/// What is written for a number, with the blank in front.
inline std::string Text(double number, int digits)
{
    std::wstring text(dcm::kNumberTextMax + 1, L'x');
    const wchar_t* const end = dcm::WriteNumber(number, digits, text.data());
    if (text.back() != L'x')
        return "more than its room";
    return {static_cast<const wchar_t*>(text.data()), end};
}

/// What is wrong with how `token` is read, alone and with others behind it in its line, where room
/// lets more be read at once; empty if nothing is.
inline std::string WrongNumber(const std::string& token, double expected)
{
    for (const std::string_view tail : {"", " ", "   \t 7.25       "}) {
        const std::string line = std::string(token).append(tail);
        dcm::NumberReader numbers(line);
        double taken = 1;
        if (numbers.Next(taken) == tail.empty() ||
            numbers.Rest() != tail.substr(tail.size() < 2 ? tail.size() : 5))
            return "what follows the number";
        const double read = dcm::ReadNumber(token);
        for (const double number : {read, taken})
            if (std::bit_cast<std::uint64_t>(number) != std::bit_cast<std::uint64_t>(expected))
                return token + " is " + std::to_string(number);
    }
    return {};
}

/// What is wrong with the text of a finite number by the standard library's measure; empty if
/// nothing is.
inline std::string WrongText(double number)
{
    for (const int digits : {dcm::kFullDigits, dcm::kShortDigits}) {
        char buffer[64] = " ";
        constexpr auto kGeneral = std::chars_format::general;
        std::string expected(
            buffer, std::to_chars(buffer + 1, std::end(buffer), number, kGeneral, digits).ptr);
        const auto letter = expected.find('e');
        if (letter != expected.npos)
            expected.insert(letter + 2, expected.size() - letter == 4 ? 1 : 0, '0');
        else if (expected.find('.') == expected.npos)
            expected += ".0";
        if (const std::string text = Text(number, digits); text != expected)
            return "not" + expected + " but" + text;
        if (digits == dcm::kFullDigits)
            if (auto wrong = WrongNumber({expected.begin() + 1, expected.end()}, number);
                !wrong.empty())
                return wrong;
    }
    return {};
}
