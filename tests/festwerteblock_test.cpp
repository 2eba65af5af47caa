#include "tests/support.h"

#include <gtest/gtest.h>

#include <chrono>
#include <limits>
#include <tuple>

using namespace test;

namespace {

constexpr double kValues[] = {0.1, 1e16, 2.0 / 3, std::numeric_limits<double>::infinity()};
constexpr const wchar_t* kTexts[] = {L"a", L"b\r\nc\t", L"d\"e", L""};

/// The block's text without its LANGNAME line and its end.
template <class Value>
std::string Lines(const Value (&values)[4], int x, int y)
{
    DCMFestwerteblock block;
    for (const Value& value : values)
        block.AddValue(value);
    block.SetXValueCount(x);
    block.SetYValueCount(y);
    return Replaced(Replaced(Written(block), "    LANGNAME \"\"\n", ""), "END\n\n", "");
}

} // namespace

TEST(Festwerteblock, WritesLinesOfFiveOrRows)
{
    const std::string line = "    WERT 0.10000000000000001    10000000000000000.0    "
                             "0.66666666666666663    1.#INF   \n";
    const std::tuple<int, int, std::string> numbers[] = {
        {3, 2, "3 @ 2\n    WERT 0.1    1e+016    0.666666666666667   \n    WERT 1.#INF   \n"},
        {4, 9, "4 @ 9\n    WERT 0.1    1e+016    0.666666666666667    1.#INF   \n"},
        {0, 3, "0 @ 3\n" + line},
        {2, 0, "4\n" + line},
        {2, -1, "2 @ -1\n" + line}};
    for (const auto& [x, y, text] : numbers)
        EXPECT_EQ(Lines(kValues, x, y), "FESTWERTEBLOCK  " + text);
    EXPECT_EQ(Lines(kTexts, 0, 0),
              "FESTWERTEBLOCK  4\n    TEXT \"a\"    \"b..c\t\"    \"d\"e\"    \"\"   \n");
    EXPECT_EQ(Lines(kTexts, 3, 1), "FESTWERTEBLOCK  3 @ 1\n    TEXT \"a\"    \"b..c\t\"    "
                                   "\"d\"e\"   \n    TEXT \"\"   \n");
}

TEST(Festwerteblock, KeepsACopyApart)
{
    DCMFestwerteblock block;
    block.SetUnit(L" ");
    const DCMFestwerteblock copy(block);
    block.AddValue(L"text");
    block = *&block;
    EXPECT_EQ(ShowAll(block.GetStringValues()), "'text'");
    EXPECT_NE(Written(block).find("    EINHEIT_W \"\"\n"), std::string::npos);
    EXPECT_EQ(block.GetUnit(), L"");
    EXPECT_EQ(copy.GetUnit(), L" ");
    EXPECT_TRUE(copy.GetStringValues().empty());
}

TEST(Festwerteblock, ReadsListsOfQuotesInLinearTime)
{
    const auto start = std::chrono::steady_clock::now();
    for (const wchar_t* piece : {L"\"\" ", L"\"a", L"\\\"", L"\" \"", L" \"\"x"}) {
        CString line(L"TEXT x");
        while (line.GetLength() < 500'000)
            line += piece;
        DCMFestwerteblock().Init(line + L"\n");
    }
    // Quadratic time would take minutes.
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(20));
}
