#include "fuzz/number_check.h"
#include "tests/support.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <sstream>

using namespace test;

namespace {

/// A number from its text or, behind 0x, its bits.
double Number(const std::string& text)
{
    return text.starts_with("0x") ? std::bit_cast<double>(std::stoull(text, nullptr, 16))
                                  : NumberSource::Parse(text);
}

void CheckWriting(double value, const std::string& full, const std::string& brief)
{
    EXPECT_EQ(Text(value, dcm::kFullDigits), " " + full);
    EXPECT_EQ(Text(value, dcm::kShortDigits), " " + brief);
    if (!std::isnan(value)) {
        EXPECT_EQ(WrongNumber(full, value), "");
    }
}

} // namespace

TEST(Number, ReadsAndWritesAsItsCasesSay)
{
    std::istringstream lines(ReadBytes(CString(DCM_TEST_DATA "/numbers.txt")));
    int cases = 0;
    for (std::string line; std::getline(lines, line);) {
        SCOPED_TRACE(line);
        std::istringstream words(line);
        std::string kind, first, second, third;
        words >> kind >> first >> second >> third;
        const std::string text = first == "''" ? "" : Unmarked(first);
        if (kind == "write")
            CheckWriting(Number(first), second, third);
        else if (kind == "read")
            EXPECT_EQ(WrongNumber(text, Number(second)), "");
        else if (kind == "integer")
            EXPECT_EQ(std::to_string(dcm::ReadInteger(text)), second);
        else
            --cases;
        ++cases;
    }
    EXPECT_GT(cases, 60);
    EXPECT_EQ(dcm::ReadNumber(" 1.5 2"), 1.5);
    EXPECT_EQ(dcm::ReadNumber("1.#INF "), 1);
    const std::string zeros(1'000'000, '0');
    EXPECT_EQ(dcm::ReadNumber(zeros + "1e-1000000"), 0.0);
    EXPECT_EQ(dcm::ReadNumber("0." + zeros + "1e1000001"), 1);
    EXPECT_EQ(dcm::ReadNumber("1" + zeros + "e-1000000"), 1);
}

TEST(Number, AgreesWithTheStandardLibrary)
{
    // DCM_TEST_NUMBERS asks for more of them, as many million as one likes.
    const char* const millions = std::getenv("DCM_TEST_NUMBERS");
    NumberSource source(millions == nullptr ? 1 : std::random_device()());
    for (long i = millions == nullptr ? 20'000 : 1'000'000 * std::atol(millions); i > 0; --i) {
        ASSERT_EQ(WrongText(source.Number()), "");
        const std::string text = source.Text();
        ASSERT_EQ(WrongNumber(text, NumberSource::Parse(text)), "");
    }
}

TEST(Number, FollowsAnotherInALineOfAnyLength)
{
    NumberSource source(1);
    std::vector<std::string> texts;
    std::string line;
    for (std::size_t i = 0; i < 2'000; ++i) {
        texts.push_back(i % 100 == 7 ? std::string(600, '0') + "8" : source.Text());
        line += texts.back() + std::string(i % 700 + 1, ' ');
    }
    dcm::NumberReader numbers(line);
    for (const std::string& text : texts) {
        double number = 1;
        EXPECT_TRUE(numbers.Next(number));
        ASSERT_EQ(std::bit_cast<std::uint64_t>(number),
                  std::bit_cast<std::uint64_t>(NumberSource::Parse(text)))
            << text;
    }
    EXPECT_EQ(numbers.Rest(), "");
}
