#include "tests/number_check.h"
#include "tests/support.h"

#include <gtest/gtest.h>

using namespace test;

namespace {

/// A number from its text or, behind 0x, its bits.
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
    NumberSource source(1);
    std::string line;
    for (std::size_t i = 0; i < 20'000; ++i) {
        ASSERT_EQ(WrongText(source.Number()), "");
        const std::string text = source.Text();
        ASSERT_EQ(WrongNumber(text, NumberSource::Parse(text)), "");
        // One behind the other in a line, with blanks of any length.
        if (i < 2'000)
            line += text + std::string(i % 700 + 1, ' ');
    }
    EXPECT_EQ(WrongLine(line + std::string(600, '0') + "8", NumberSource::Parse), "");
}
