#include "tests/support.h"

#include <gtest/gtest.h>

#include <map>
#include <sstream>

using namespace test;

namespace {

/// Those of the fields that are not empty, each behind its label.
template <class... Rest>
std::string Fields(const std::string& label, const auto& value, const Rest&... rest)
{
    std::string text = value == std::decay_t<decltype(value)>() ? "" : " " + label + " ";
    if constexpr (std::is_same_v<decltype(value), const std::string&>)
        text += value;
    else if (!text.empty())
        text += Show(value);
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
    std::string input, fields, written;
};

template <class Block>
void Check(const Case& expected)
{
    Block block;
    std::string outcome;
    try {
        outcome = block.Init(dcm::Widen(expected.input)) == E_FAIL ? " refused" : "";
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

const std::map<std::string, void (*)(const Case&)> kChecks = {
    {"FESTWERT", Check<DCMFestwert>},
    {"TEXTSTRING", Check<DCMTextstring>},
    {"FESTWERTEBLOCK", Check<DCMFestwerteblock>},
    {"STUETZSTELLENVERTEILUNG", Check<DCMStuetzstellenverteilung>},
    {"KENNLINIE", Check<DCMKennlinie>},
    {"FESTKENNLINIE", Check<DCMFestkennlinie>},
    {"GRUPPENKENNLINIE", Check<DCMGruppenkennlinie>},
    {"KENNFELD", Check<DCMKennfeld>},
    {"FESTKENNFELD", Check<DCMFestkennfeld>},
    {"GRUPPENKENNFELD", Check<DCMGruppenkennfeld>}};

/// Returns how many cases the file has.
int CheckFile(const std::string& path)
{
    std::istringstream lines(Unmarked(ReadBytes(dcm::Widen(path))) + "\n");
    std::string title, line;
    Case now;
    int cases = 0;
    while (std::getline(lines, line)) {
        if (line.starts_with("  ")) {
            now.input += line.substr(2) + "\n";
        } else if (line.starts_with("=")) {
            now.fields = line.substr(1);
        } else if (line.starts_with(">")) {
            now.written += (line.size() > 2 ? line.substr(2) : "") + "\n";
        } else if (!line.empty() && line[0] != '#') {
            title = line;
        } else if (!title.empty()) {
            SCOPED_TRACE(path + ": " + title);
            std::istringstream kinds(title.substr(0, title.find(':')));
            for (std::string kind; kinds >> kind;)
                kChecks.at(kind)(now);
            ++cases;
            title.clear();
            now = {};
        }
    }
    return cases;
}

} // namespace

TEST(Blocks, ReadAndWriteAsTheirCasesSay)
{
    for (const char* kinds : {"attributes", "festwert", "festwerteblock", "points"})
        EXPECT_GT(CheckFile(DCM_TEST_DATA "/blocks/" + std::string(kinds) + ".txt"), 4);
}
