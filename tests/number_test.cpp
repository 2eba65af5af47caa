#include "dcm/elements/exact_decimal.h"
#include "dcm/platform/wide_product.h"
#include "tests/number_check.h"
#include "tests/support.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <bit>
#include <cfloat>
#include <cmath>
#include <cstdint>
#include <random>
#include <string>

using namespace test;

namespace {

/// A number from its text or, after 0x, its bits.
double Number(const std::string& text)
{
    return text.starts_with("0x") ? std::bit_cast<double>(std::stoull(text, nullptr, 16))
                                  : NumberSource::Parse(text);
}

} // namespace

TEST(Number, ReadsAndWritesAsItsCasesSay)
{
    const auto rows = Rows(DCM_TEST_DATA "/numbers.txt");
    EXPECT_GT(rows.size(), 60U);
    for (const auto& row : rows) {
        SCOPED_TRACE(testing::PrintToString(row));
        // Registers wider than a double turn a signaling not-a-number into a quiet one.
        if (FLT_EVAL_METHOD == 2 && row.back().ends_with("SNAN"))
            continue;
        if (row[0] == "integer") {
            EXPECT_EQ(std::to_string(dcm::ReadInteger(row[1])), row[2]);
        } else if (row[0] == "read") {
            EXPECT_EQ(WrongNumber(row[1], Number(row[2])), "");
        } else {
            EXPECT_EQ(Text(Number(row[1]), dcm::kFullDigits), " " + row[2]);
            EXPECT_EQ(Text(Number(row[1]), dcm::kShortDigits), " " + row[3]);
        }
    }
    EXPECT_EQ(dcm::ReadNumber(" 1.5 2"), 1.5);
    EXPECT_EQ(dcm::ReadNumber("1.#INF "), 1);
    const std::string zeros(1'000'000, '0');
    EXPECT_EQ(dcm::ReadNumber(zeros + "1e-1000000"), 0.0);
    EXPECT_EQ(dcm::ReadNumber("0." + zeros + "1e1000001"), 1);
    EXPECT_EQ(dcm::ReadNumber("1" + zeros + "e-1000000"), 1);
}

TEST(Number, AgreesWithTheStandardLibrary)
{
    if (!NumberSource::ParsesExactly())
        GTEST_SKIP() << "The standard library of this machine reads numbers wrongly.";
    NumberSource source(1);
    std::string line;
    for (std::size_t i = 0; i < 20'000; ++i) {
        ASSERT_EQ(WrongText(source.Number()), "");
        const std::string text = source.Text();
        ASSERT_EQ(WrongNumber(text, NumberSource::Parse(text)), "");
        // All in one line, with blanks of any length.
        if (i < 2'000)
            line += text + std::string(i % 700 + 1, ' ');
    }
    EXPECT_EQ(WrongLine(line + std::string(600, '0') + "8", NumberSource::Parse), "");
}

// The ways for numbers that are hard to tell, taken for all numbers.
TEST(Number, AgreesWithTheStandardLibraryOnTheWaysForHardNumbers)
{
    if (!NumberSource::ParsesExactly())
        GTEST_SKIP() << "The standard library of this machine reads numbers wrongly.";
    NumberSource source(2);
    for (std::size_t i = 0; i < 20'000; ++i) {
        std::string text = source.Text();
        SCOPED_TRACE(text);
        const double expected = std::abs(NumberSource::Parse(text));
        const auto letter = std::min(text.find('e'), text.size());
        int exponent = letter < text.size() ? std::stoi(text.substr(letter + 1)) : 0;
        const auto point = std::min(text.find('.'), letter);
        exponent -= static_cast<int>(letter - std::min(point + 1, letter));
        text.resize(letter);
        std::erase_if(text, [](char c) { return c == '.' || c == '-'; });
        ASSERT_EQ(dcm::NearestDouble(text, exponent), expected);
        if (text.size() < 20) {
            const dcm::Decimal decimal{std::stoull(text), exponent};
            ASSERT_EQ(dcm::NearestDouble(decimal), expected);
        }
    }
}

TEST(Number, MultipliesAlikeWithAndWithoutWideIntegers)
{
    const auto alike = [](std::uint64_t a, std::uint64_t b) {
        const auto product = dcm::Multiply(a, b);
        const auto other = dcm::MultiplyInHalves(a, b);
        return product.high == other.high && product.low == other.low;
    };
    std::mt19937_64 random(3);
    for (std::size_t i = 0; i < 100'000; ++i) {
        // Words of all sizes, and those whose upper bits are all set.
        const auto a = random() >> random() % 64;
        const auto b = random() >> random() % 64;
        ASSERT_TRUE(alike(a, b) && alike(~a, b) && alike(~a, ~b)) << a << ' ' << b;
    }
    // Fixed results, for compilers that have but one of the ways.
    constexpr auto all = ~std::uint64_t{0};
    static_assert(dcm::Multiply(all, all).high == all - 1 && dcm::Multiply(all, all).low == 1);
    static_assert(dcm::MultiplyInHalves(all, all).high == all - 1);
    static_assert(dcm::MultiplyInHalves(all, all).low == 1);
}
