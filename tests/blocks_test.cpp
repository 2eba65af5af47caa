#include "tests/support.h"

#include <gtest/gtest.h>

#include <algorithm>

using namespace test;

namespace {

/// The fields that are not empty, each after its label.
template <class Value, class... Rest>
std::string Fields(const char* label, const Value& value, const Rest&... rest)
{
    std::string text;
    if constexpr (std::is_same_v<Value, std::string>) {
        text = value;
    } else if (value != Value()) {
        text = Show(value);
    }
    if (!text.empty())
        text = std::string(" ") + label + " " + text;
    if constexpr (sizeof...(rest) > 0)
        text += Fields(rest...);
    return text;
}

std::string Describe(const DCMFestwert& b)
{
    CComVariant value(L"old");
    EXPECT_EQ(b.GetValue(&value), S_OK);
    return Fields("unit W", b.GetUnit(), "value", value.vt == VT_EMPTY ? "" : Show(value));
}

std::string Describe(const DCMFestwerteblock& b)
{
    return Fields("unit W", b.GetUnit(), "count X", b.GetXValueCount(), "count Y",
                  b.GetYValueCount(), "numbers", ShowAll(b.GetDoubleValues()), "texts",
                  ShowAll(b.GetStringValues()));
}

std::string Describe(const DCMStuetzstellenverteilung& b)
{
    return Fields("unit X", b.GetUnit(), "values",
                  Points(b, &DCMStuetzstellenverteilung::GetValues));
}

std::string Describe(const DCMKennlinie& b)
{
    return Fields("unit X", b.GetUnit_X(), "unit W", b.GetUnit_W(), "length X", b.GetAxisLenghtX(),
                  "shared X", b.GetStuetzstellenverteilung(), "axis X",
                  Points(b, PointsOfCurve(&DCMKennlinie::GetAxis)), "values",
                  Points(b, PointsOfCurve(&DCMKennlinie::GetValues)));
}

std::string Describe(const DCMKennfeld& b)
{
    return Fields("unit X", b.GetUnit_X(), "unit Y", b.GetUnit_Y(), "unit W", b.GetUnit_W(),
                  "length X", b.GetAxisLenghtX(), "length Y", b.GetAxisLenghtY(), "shared X",
                  b.GetStuetzstellenverteilungX(), "shared Y", b.GetStuetzstellenverteilungY(),
                  "axis X", Points(b, &DCMKennfeld::GetAxis_X), "axis Y",
                  Points(b, &DCMKennfeld::GetAxis_Y), "values", Points(b, &DCMKennfeld::GetValues));
}

/// One case of the files in data/blocks/, which attributes.txt explains.
struct Case
{
    std::string title, input, fields, written;
    /// The line of the title.
    int line = 0;
};

template <class Block>
void Check(const Case& expected)
{
    Block block;
    std::string outcome;
    try {
        outcome = block.Init(dcm::FromUtf8(expected.input)) == E_FAIL ? " refused" : "";
    } catch (const dcm::ResultError& error) {
        outcome = error.Code() == E_INVALIDARG ? " raised" : " raised something else";
    }
    EXPECT_EQ(outcome +
                  Fields("name", block.GetName(), "langname", block.GetLangname(), "displayname",
                         block.GetDisplayname(), "funktion", block.GetFunction()) +
                  Describe(block),
              expected.fields);
    // An empty line follows a block; a map may write nothing at all.
    if (!expected.written.empty()) {
        EXPECT_EQ(Written(block), expected.written == "\n" ? "" : expected.written + "\n");
    }
}

/// Checks a case of a file for each kind that is named before the colon in its title.
void CheckKinds(const Case& expected, const std::string& file)
{
    const testing::ScopedTrace trace(file.c_str(), expected.line, expected.title);
    const std::string kinds = " " + expected.title.substr(0, expected.title.find(':')) + " ";
    bool known = false;
    ForEachKind([&](const std::string& keyword, auto get, auto) {
        if (kinds.find(" " + keyword + " ") == kinds.npos)
            return;
        known = true;
        Check<BlockOf<decltype(get)>>(expected);
    });
    EXPECT_TRUE(known);
}

} // namespace

TEST(Blocks, ReadAndWriteAsTheirCasesSay)
{
    int cases = 0;
    for (const std::string kinds : {"attributes", "festwert", "festwerteblock", "points"}) {
        const std::string file = DCM_TEST_DATA "/blocks/" + kinds + ".txt";
        std::istringstream lines(Unmarked(ReadBytes(dcm::Widen(file))) + "\n");
        Case now;
        int number = 0;
        for (std::string line; std::getline(lines, line);) {
            ++number;
            const std::string content = line.substr(std::min<std::size_t>(line.size(), 2));
            if (line.starts_with("  ")) {
                now.input += content + "\n";
            } else if (line.starts_with(">")) {
                now.written += content + "\n";
            } else if (line.starts_with("=")) {
                now.fields = line.substr(1);
            } else if (!line.empty() && line[0] != '#') {
                now.title = line;
                now.line = number;
            } else if (!now.title.empty()) {
                CheckKinds(now, file);
                ++cases;
                now = {};
            }
        }
    }
    EXPECT_GT(cases, 80);
}
