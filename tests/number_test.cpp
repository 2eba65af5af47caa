#include "dcm/elements/number.h"

#include "fuzz/number_check.h"

#include <gtest/gtest.h>

#include <array>
#include <bit>
#include <cstdint>
#include <limits>
#include <string>
#include <string_view>

namespace {

constexpr double kInfinity = std::numeric_limits<double>::infinity();

std::wstring Text(double value, int digits)
{
    std::array<wchar_t, dcm::kNumberTextMax> buffer;
    return {buffer.data(), dcm::WriteNumber(value, digits, buffer.data())};
}

TEST(Number, WritesSeventeenAndFifteenDigits)
{
    const struct
    {
        double value;
        std::wstring_view full;
        std::wstring_view brief;
    } cases[] = {
        {0.0, L" 0.0", L" 0.0"},
        {-0.0, L" -0.0", L" -0.0"},
        {1, L" 1.0", L" 1.0"},
        {-2.25, L" -2.25", L" -2.25"},
        {0.1, L" 0.10000000000000001", L" 0.1"},
        {2 / 3.0, L" 0.66666666666666663", L" 0.666666666666667"},
        {0.0001, L" 0.0001", L" 0.0001"},
        {1e-5, L" 1.0000000000000001e-005", L" 1e-005"},
        {1e16, L" 10000000000000000.0", L" 1e+016"},
        {12345678901234567.0, L" 12345678901234568.0", L" 1.23456789012346e+016"},
        {1e17, L" 1e+017", L" 1e+017"},
        {-1.7976931348623157e308, L" -1.7976931348623157e+308", L" -1.79769313486232e+308"},
        {5e-324, L" 4.9406564584124654e-324", L" 4.94065645841247e-324"},
        {999999999999999.5, L" 999999999999999.5", L" 1e+015"},
        {kInfinity, L" 1.#INF", L" 1.#INF"},
        {-kInfinity, L" -1.#INF", L" -1.#INF"},
    };
    for (const auto& c : cases) {
        EXPECT_EQ(Text(c.value, dcm::kFullDigits), c.full);
        EXPECT_EQ(Text(c.value, dcm::kShortDigits), c.brief);
        const double back = dcm::ReadNumber(c.full.substr(1));
        EXPECT_EQ(std::bit_cast<std::uint64_t>(back), std::bit_cast<std::uint64_t>(c.value));
    }
    // No double holds a signalling not-a-number on its way through every register, its bits do.
    const struct
    {
        std::uint64_t bits;
        std::wstring_view text;
    } names[] = {
        {0x7FF8'0000'0000'0000, L" 1.#QNAN"},  {0xFFF8'0000'0000'0000, L" -1.#IND"},
        {0xFFF8'0000'0000'0001, L" -1.#QNAN"}, {0x7FF0'0000'0000'0001, L" 1.#SNAN"},
        {0xFFF4'0000'0000'0000, L" -1.#SNAN"},
    };
    for (const auto& c : names)
        EXPECT_EQ(Text(std::bit_cast<double>(c.bits), dcm::kFullDigits), c.text);
}

TEST(Number, TakesTheLongestNumberOfAToken)
{
    const struct
    {
        std::wstring_view token;
        double value;
    } cases[] = {
        {L"", 0.0},
        {L".", 0.0},
        {L"-.", 0.0},
        {L"-abc", 0.0},
        {L"-0", -0.0},
        {L".5", 0.5},
        {L"5.", 5},
        {L"+5", 5},
        {L"1.e5", 100000},
        {L"1E+2", 100},
        {L"1e", 1},
        {L"1e+", 1},
        {L"2e0000000003", 2000},
        {L"1.5.5", 1.5},
        {L"1,5", 1},
        {L"12abc", 12},
        {L"1d5", 1},
        {L"0x10", 0.0},
        {L"inf", 0.0},
        {L"-NaN", 0.0},
        {L"\t\v-3", -3},
        {L"1.5\t", 1.5},
        {L"1.#inf", kInfinity},
        {L"-1.#INF", -kInfinity},
        {L"+1.#INF", 1},
        {L"\t1.#INF", 1},
        {L"1.#INFx", 1},
        {L"-1.#QNAN", -1},
        {L"1\u0662", 1},
        {L"\u0661", 0.0},
        {L"1234567\u01301", 1234567},
        {L"1e999999999999999999999", kInfinity},
        {L"-1e-99999999999999999999", -0.0},
        {L"0.000000000000000000000000000001e30", 1},
        {L"18446744073709551616", 18446744073709551616.0},
        {L"0.00012345678901234567", 0.00012345678901234567},
        {L"9007199254740993", 9007199254740992},
        {L"9007199254740993.00000000000000000000000000000001", 9007199254740994},
        {L"1.7976931348623159e308", kInfinity},
        {L"2.4703282292062328e-324", 5e-324},
    };
    for (const auto& c : cases) {
        // As a whole, and taken from a line, where room behind it lets more be read at once.
        for (const std::wstring_view tail : {L"", L" ", L"   \t 7.25       "}) {
            const std::wstring line = std::wstring(c.token).append(tail);
            std::wstring_view rest = line;
            double taken = 1;
            EXPECT_EQ(dcm::TakeNumber(rest, taken), !tail.empty());
            EXPECT_EQ(rest, tail.size() < 2 ? L"" : tail.substr(5));
            const double read = dcm::ReadNumber(std::wstring_view(line).substr(0, c.token.size()));
            for (const double value : {taken, read})
                EXPECT_EQ(std::bit_cast<std::uint64_t>(value),
                          std::bit_cast<std::uint64_t>(c.value))
                    << testing::PrintToString(line) << " is " << value;
        }
    }
    EXPECT_EQ(dcm::ReadNumber(L" 1.5 2"), 1.5);
    EXPECT_EQ(dcm::ReadNumber(L"1.#INF "), 1);
    EXPECT_EQ(dcm::ReadNumber(std::wstring(1'000'000, L'0') + L"1e-1000000"), 0.0);
    EXPECT_EQ(dcm::ReadNumber(L"0." + std::wstring(1'000'000, L'0') + L"1e1000001"), 1);
    EXPECT_EQ(dcm::ReadNumber(L"1" + std::wstring(1'000'000, L'0') + L"e-1000000"), 1);
}

TEST(Number, AgreesWithTheStandardLibrary)
{
    NumberSource source(1);
    for (int i = 0; i < 20'000; ++i) {
        ASSERT_EQ(WrongText(source.Number()), "");
        ASSERT_EQ(WrongNumber(source.Text()), "");
    }
}

TEST(Number, ReadsIntegersOfThirtyTwoBits)
{
    const struct
    {
        std::wstring_view text;
        std::int32_t value;
    } cases[] = {
        {L"", 0},
        {L"x1", 0},
        {L"- 1", 0},
        {L" \t\r+12x", 12},
        {L"-7.9", -7},
        {L"2147483647", 2147483647},
        {L"2147483648", 2147483647},
        {L"-2147483648", -2147483647 - 1},
        {L"-99999999999999999999999", -2147483647 - 1},
    };
    for (const auto& c : cases)
        EXPECT_EQ(dcm::ReadInteger(c.text), c.value) << testing::PrintToString(c.text);
}

} // namespace
