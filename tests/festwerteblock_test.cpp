#include "tests/support.h"

#include <gtest/gtest.h>

#include <chrono>
#include <cstdint>
#include <limits>

using namespace test;

namespace {

DCMFestwerteblock WithNumbers(int count)
{
    DCMFestwerteblock block;
    for (int i = 1; i <= count; ++i)
        block.AddValue(i);
    return block;
}

/// What stands behind the LANGNAME line.
std::string ValueLines(DCMFestwerteblock block)
{
    const std::string text = Written(block);
    const std::string_view langname = "    LANGNAME \"\"\n";
    const std::size_t start = text.find(langname) + langname.size();
    return text.substr(start, text.find("END\n\n") - start);
}

} // namespace

TEST(Festwerteblock, ReadsNameAndCounts)
{
    const struct
    {
        std::string_view rest;
        std::wstring_view name;
        std::int32_t x, y;
    } cases[] = {
        {"A 3", L"A", 0, 0},
        {"A", L"", 0, 0},
        {"", L"", 0, 0},
        {"M 3 @ 2", L"M", 3, 2},
        {"  \"M  10 @ 20\" ", L"M", 10, 20},
        {"M 3@2", L"M", 0, 0},
        {"M 33@22", L"M", 3, 2},
        {"M @ 2", L"M", 0, 0},
        {"M 3 @", L"M", 3, 0},
        {"M 3 @ 2 @ 9", L"M", 3, 2},
        {"3@12", L"", 0, 2},
        {"M\t 3 @  -2x", L"M", 3, -2},
        {"M 99999999999 @ -99999999999", L"M", std::numeric_limits<std::int32_t>::max(),
         std::numeric_limits<std::int32_t>::min()},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.rest);
        const auto block =
            Parsed<DCMFestwerteblock>("FestWerteBlock " + std::string(c.rest) + "\n");
        EXPECT_EQ(block.GetName(), c.name);
        EXPECT_EQ(block.GetXValueCount(), c.x);
        EXPECT_EQ(block.GetYValueCount(), c.y);
    }
}

TEST(Festwerteblock, ReadsNumbersAndTexts)
{
    const struct
    {
        std::string_view lines;
        std::string_view numbers;
        std::string_view texts;
    } cases[] = {
        {"WERT 1 2 3\n", "1 2 3", ""},
        {"WERT 1  2 \n   wert 3\n", "1 2 3", ""},
        {"WERT 1.#INF 2 -1.#inf\n", "inf 2 -inf", ""},
        {"WERT 1,5 x 0x10\n", "1 0 0", ""},
        // Only a blank ends a number; other white space goes with the blanks behind it.
        {"WERT 1\t2 \t3\n", "1 3", ""},
        {"WERT \"1 \t\"\n", "1 0", ""},
        {"WERT \"1\" \"2\"\n", "1 0", ""},
        {"TEXT a b\n", "", "'a b'"},
        {"TEXT \"a\" \"b c\"\n", "", "'a' 'b c'"},
        {"TEXT \"a\"    \"b\"   \nTEXT \"c\"\n", "", "'a' 'b' 'c'"},
        {"TEXT 1 2\n", "", "'1 2'"},
        {"TEXT \"x\" \"\"\n", "", "'x'"},
        {"TEXT \"\"\nTEXT \nTEXT \" \" \"\n", "", ""},
        {"TEXT \"a\\b\\n\" \"c\"\n", "", "'a\\b\\n' 'c'"},
        // A quote that does not close belongs to the text.
        {"TEXT \"a\"b\" \"c\"\n", "", "'a\"b' 'c'"},
        {"TEXT \"a\\\" b\" \"c\"\n", "", "'a\\\" b' 'c'"},
        {"TEXT \"a\"\"b\"\n", "", "'a\"\"b'"},
        {"TEXT \"a\" \"b\\\"\n", "", "'a' 'b\\'"},
        // An empty text is one when another follows.
        {"TEXT \"a\" \"\" \"b\"\n", "", "'a' '' 'b'"},
        {"TEXT \"a\"   \"\"   \"\"   \"b\"   \n", "", "'a' '' '' 'b'"},
        {"TEXT \"a\" \"\" \" b\"\n", "", "'a' ' ' 'b'"},
        {"WERT 1\nTEXT a\nwert 2\ntext \"b\"\n", "1 2", "'a' 'b'"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.lines);
        const auto block = Parsed<DCMFestwerteblock>(c.lines);
        EXPECT_EQ(ShowAll(block.GetDoubleValues()), c.numbers);
        EXPECT_EQ(ShowAll(block.GetStringValues()), c.texts);
    }
}

TEST(Festwerteblock, RaisesAtAWertLineWithoutAValue)
{
    for (const char* line : {"WERT \n", "WERT  \t \n", "WERT \"\" \"\n"}) {
        SCOPED_TRACE(line);
        auto block = Parsed<DCMFestwerteblock>("WERT 1\n");
        try {
            block.Init(dcm::Widen("FESTWERTEBLOCK A 3\nWERT 2\n" + std::string(line) + "WERT 3\n"));
            ADD_FAILURE() << "read";
        } catch (const dcm::ResultError& error) {
            EXPECT_EQ(error.Code(), E_INVALIDARG);
        }
        EXPECT_EQ(ShowAll(block.GetDoubleValues()), "1 2");
        EXPECT_EQ(block.GetName(), L"A");
    }
}

TEST(Festwerteblock, ReadsListsOfQuotesInLinearTime)
{
    const auto time = [](std::size_t size) {
        const auto start = std::chrono::steady_clock::now();
        for (const char* piece : {"\"\" ", "\"a", "\\\"", "\" \"", " \"\"x"}) {
            std::string line = "TEXT x";
            while (line.size() < size)
                line += piece;
            Parsed<DCMFestwerteblock>(line + "\n");
        }
        return std::chrono::steady_clock::now() - start;
    };
    // Quadratic time would take minutes.
    EXPECT_LT(time(500'000), std::chrono::seconds(20));
}

TEST(Festwerteblock, WritesLinesOfFiveOrRows)
{
    DCMFestwerteblock list = WithNumbers(7);
    list.SetName(L"A");
    list.SetUnit(L"-");
    EXPECT_EQ(Written(list), "FESTWERTEBLOCK A 7\n    LANGNAME \"\"\n    EINHEIT_W \"-\"\n"
                             "    WERT 1.0    2.0    3.0    4.0    5.0   \n"
                             "    WERT 6.0    7.0   \nEND\n\n");
    EXPECT_EQ(ValueLines(WithNumbers(0)), "");
    EXPECT_EQ(ValueLines(WithNumbers(5)), "    WERT 1.0    2.0    3.0    4.0    5.0   \n");

    const struct
    {
        std::int32_t x, y;
        std::string_view first;
        std::string_view values;
    } shapes[] = {
        {3, 2, "3 @ 2", "    WERT 0.1    1e+016    0.666666666666667   \n    WERT 1.#INF   \n"},
        {1, 9, "1 @ 9",
         "    WERT 0.1   \n    WERT 1e+016   \n    WERT 0.666666666666667   \n    WERT 1.#INF   "
         "\n"},
        {0, 3, "0 @ 3",
         "    WERT 0.10000000000000001    10000000000000000.0    0.66666666666666663    1.#INF   "
         "\n"},
        {2, 0, "4",
         "    WERT 0.10000000000000001    10000000000000000.0    0.66666666666666663    1.#INF   "
         "\n"},
        {2, -1, "2 @ -1",
         "    WERT 0.10000000000000001    10000000000000000.0    0.66666666666666663    1.#INF   "
         "\n"},
    };
    for (const auto& c : shapes) {
        SCOPED_TRACE(c.first);
        DCMFestwerteblock block;
        for (const double value : {0.1, 1e16, 2.0 / 3, std::numeric_limits<double>::infinity()})
            block.AddValue(value);
        block.SetXValueCount(c.x);
        block.SetYValueCount(c.y);
        block.AddValue(L"not written beside numbers");
        EXPECT_TRUE(Written(block).starts_with("FESTWERTEBLOCK  " + std::string(c.first) + "\n"));
        EXPECT_EQ(ValueLines(block), c.values);
    }
    const auto fewer = Parsed<DCMFestwerteblock>("FESTWERTEBLOCK A 7\nWERT 1 2\n");
    EXPECT_TRUE(Written(DCMFestwerteblock(fewer)).starts_with("FESTWERTEBLOCK A 2\n"));
}

TEST(Festwerteblock, WritesTextsAndDropsTheBlankUnit)
{
    DCMFestwerteblock block;
    for (const wchar_t* text : {L"a", L"b\r\nc\t", L"d\"e", L"", L"f", L"g"})
        block.AddValue(text);
    block.SetUnit(L" ");
    const DCMFestwerteblock copy(block);
    EXPECT_EQ(Written(block), "FESTWERTEBLOCK  6\n    LANGNAME \"\"\n    EINHEIT_W \"\"\n"
                              "    TEXT \"a\"    \"b..c\t\"    \"d\"e\"    \"\"    \"f\"   \n"
                              "    TEXT \"g\"   \nEND\n\n");
    EXPECT_EQ(block.GetUnit(), L"");
    EXPECT_EQ(copy.GetUnit(), L" ");
    block.SetXValueCount(4);
    block.SetYValueCount(2);
    EXPECT_EQ(ValueLines(block), "    TEXT \"a\"    \"b..c\t\"    \"d\"e\"    \"\"   \n"
                                 "    TEXT \"f\"    \"g\"   \n");
    block.AddValue(1.0);
    block = *&block;
    EXPECT_EQ(ShowAll(block.GetDoubleValues()), "1");
    EXPECT_EQ(copy.GetDoubleValues().size(), 0U);
}
