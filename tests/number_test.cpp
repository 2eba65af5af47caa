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
        EXPECT_EQ(WrongNumber(std::wstring(full.begin(), full.end()), value), "");
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
        CString text;
        dcm::AppendWide(text, first == "''" ? "" : Unmarked(first), dcm::Encoding::kUtf8);
        if (kind == "write")
            CheckWriting(Number(first), second, third);
        else if (kind == "read")
            EXPECT_EQ(WrongNumber(std::wstring(text.View()), Number(second)), "");
        else if (kind == "integer")
            EXPECT_EQ(std::to_string(dcm::ReadInteger(text)), second);
        else
            --cases;
        ++cases;
    }
    EXPECT_GT(cases, 60);
    EXPECT_EQ(dcm::ReadNumber(L" 1.5 2"), 1.5);
    EXPECT_EQ(dcm::ReadNumber(L"1.#INF "), 1);
    const std::wstring zeros(1'000'000, L'0');
    EXPECT_EQ(dcm::ReadNumber(zeros + L"1e-1000000"), 0.0);
    EXPECT_EQ(dcm::ReadNumber(L"0." + zeros + L"1e1000001"), 1);
    EXPECT_EQ(dcm::ReadNumber(L"1" + zeros + L"e-1000000"), 1);
}

TEST(Number, AgreesWithTheStandardLibrary)
{
    // DCM_TEST_NUMBERS asks for more of them, as many million as one likes.
    const char* const millions = std::getenv("DCM_TEST_NUMBERS");
    NumberSource source(millions == nullptr ? 1 : std::random_device()());
    for (long i = millions == nullptr ? 20'000 : 1'000'000 * std::atol(millions); i > 0; --i) {
        ASSERT_EQ(WrongText(source.Number()), "");
        const std::string text = source.Text();
        ASSERT_EQ(WrongNumber(std::wstring(text.begin(), text.end()), NumberSource::Parse(text)),
                  "");
    }
}
