#include "tests/support.h"

#include <gtest/gtest.h>

#include <map>
#include <sstream>

using namespace test;

namespace {

/// The fields of a block that are not empty, each behind its label.
class Fields
{
public:
    void Add(const std::string& label, const std::string& value)
    {
        if (!value.empty())
            m_text += (m_text.empty() ? "" : " ") + label + " " + value;
    }
    void Add(const std::string& label, const CString& text)
    {
        Add(label, text.IsEmpty() ? "" : Show(text));
    }
    void Add(const std::string& label, int number)
    {
        Add(label, number == 0 ? "" : std::to_string(number));
    }
    const std::string& Text() const { return m_text; }

private:
    std::string m_text;
};

void Describe(const DCMFestwert& block, Fields& fields)
{
    fields.Add("unit W", block.GetUnit());
    CComVariant value(L"old");
    EXPECT_EQ(block.GetValue(&value), S_OK);
    fields.Add("value", value.vt == VT_EMPTY ? "" : Show(value));
}

void Describe(const DCMFestwerteblock& block, Fields& fields)
{
    fields.Add("unit W", block.GetUnit());
    fields.Add("count X", block.GetXValueCount());
    fields.Add("count Y", block.GetYValueCount());
    fields.Add("numbers", ShowAll(block.GetDoubleValues()));
    fields.Add("texts", ShowAll(block.GetStringValues()));
}

void Describe(const DCMStuetzstellenverteilung& block, Fields& fields)
{
    fields.Add("unit X", block.GetUnit());
    fields.Add("values", Points(block, &DCMStuetzstellenverteilung::GetValues));
}

void Describe(const DCMKennlinie& block, Fields& fields)
{
    fields.Add("unit X", block.GetUnit_X());
    fields.Add("unit W", block.GetUnit_W());
    fields.Add("length X", block.GetAxisLenghtX());
    fields.Add("shared X", block.GetStuetzstellenverteilung());
    fields.Add("axis X", Points(block, PointsOfCurve(&DCMKennlinie::GetAxis)));
    fields.Add("values", Points(block, PointsOfCurve(&DCMKennlinie::GetValues)));
}

void Describe(const DCMKennfeld& block, Fields& fields)
{
    fields.Add("unit X", block.GetUnit_X());
    fields.Add("unit Y", block.GetUnit_Y());
    fields.Add("unit W", block.GetUnit_W());
    fields.Add("length X", block.GetAxisLenghtX());
    fields.Add("length Y", block.GetAxisLenghtY());
    fields.Add("shared X", block.GetStuetzstellenverteilungX());
    fields.Add("shared Y", block.GetStuetzstellenverteilungY());
    fields.Add("axis X", Points(block, &DCMKennfeld::GetAxis_X));
    fields.Add("axis Y", Points(block, &DCMKennfeld::GetAxis_Y));
    fields.Add("values", Points(block, &DCMKennfeld::GetValues));
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
    Fields fields;
    const auto code = [](HRESULT result) {
        char text[8];
        const auto end = std::to_chars(text, text + 8, static_cast<unsigned>(result), 16).ptr;
        return result == S_OK ? std::string() : std::string(text, end);
    };
    try {
        fields.Add("returns", code(block.Init(dcm::Widen(expected.input))));
    } catch (const dcm::ResultError& error) {
        fields.Add("raises", code(error.Code()));
    }
    fields.Add("name", block.GetName());
    fields.Add("langname", block.GetLangname());
    fields.Add("displayname", block.GetDisplayname());
    fields.Add("funktion", block.GetFunction());
    Describe(block, fields);
    EXPECT_EQ(fields.Text(), expected.fields);
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
    std::istringstream lines(
        Replaced(Replaced(ReadBytes(dcm::Widen(path)), "\xC2\xB7", " "), "\xE2\x86\x92", "\t") +
        "\n");
    std::string title, line;
    Case now;
    int cases = 0;
    while (std::getline(lines, line)) {
        if (line.starts_with("  ")) {
            now.input += line.substr(2) + "\n";
        } else if (line.starts_with("=")) {
            now.fields = line.size() > 2 ? line.substr(2) : "";
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
