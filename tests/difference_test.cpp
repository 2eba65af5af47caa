#include "tests/support.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <span>

using namespace test;
using dcm::Comparison;
using dcm::Difference;
using dcm::Parameter;

namespace {

using test::Show;

std::string Index(std::size_t index)
{
    return index == dcm::kNoIndex ? "-" : std::to_string(index);
}

std::string Show(const char* what, const std::vector<dcm::ValueDifference>& values)
{
    std::string text;
    for (const dcm::ValueDifference& value : values) {
        text += std::string(" ") + what + Index(value.oldIndex) + ">" + Index(value.newIndex) +
                " " + Show(value.oldValue) + ">" + Show(value.newValue);
    }
    return text;
}

/// One line for each parameter that differs.
std::string Show(const std::vector<Difference>& differences)
{
    std::string text;
    for (const Difference& d : differences) {
        text += d.change == dcm::Change::kAdded     ? "+ "
                : d.change == dcm::Change::kRemoved ? "- "
                                                    : "~ ";
        text += dcm::ToUtf8(dcm::KeywordOf(d.kind)) + " " + dcm::ToUtf8(d.name) + " " +
                Index(d.oldIndex) + ">" + Index(d.newIndex);
        for (const dcm::FieldDifference& field : d.fields) {
            text += " " + dcm::ToUtf8(dcm::KeywordOf(field.field)) + " " + Show(field.oldText) +
                    ">" + Show(field.newText);
        }
        text += Show("x", d.x) + Show("y", d.y) + Show("w", d.values) + "\n";
    }
    return text;
}

/// The parameters of blocks, each of which ends before the next one's keyword.
std::vector<Parameter> Read(std::string text)
{
    DCMConverter document;
    ImportBytes(document, Replaced(std::move(text), ";", "\n"));
    return dcm::ParametersOf(document);
}

struct Case
{
    const char* before;
    const char* after;
    const char* shown;
    Comparison comparison = {};
};

void ExpectAll(std::span<const Case> cases)
{
    for (const Case& c : cases) {
        SCOPED_TRACE(std::string(c.before) + " / " + c.after);
        const auto before = Read(c.before);
        EXPECT_EQ(Show(dcm::Differences(before, Read(c.after), c.comparison)), c.shown);
        EXPECT_EQ(Show(dcm::Differences(before, Read(c.before))), "");
    }
}

Comparison Absolute(double tolerance)
{
    Comparison comparison;
    comparison.absolute = tolerance;
    return comparison;
}

Comparison Relative(double tolerance)
{
    Comparison comparison;
    comparison.relative = tolerance;
    return comparison;
}

Comparison Ignoring(bool Comparison::*what)
{
    Comparison comparison;
    comparison.*what = true;
    return comparison;
}

} // namespace

TEST(Differences, PairParametersByKindAndName)
{
    const Case cases[] = {
        {"", "FESTWERT a;WERT 1;;", "+ FESTWERT a ->0\n"},
        {"FESTWERT a;WERT 1;;", "", "- FESTWERT a 0>-\n"},
        {"FESTWERT a;WERT 1;;", "TEXTSTRING a;WERT 1;;FESTWERT A;WERT 1;;",
         "- FESTWERT a 0>-\n+ FESTWERT A ->0\n+ TEXTSTRING a ->1\n"},
        {"FESTWERT a;WERT 1;;FESTWERT b;WERT 2;;TEXTSTRING c;WERT 3;;",
         "FESTWERT n;WERT 0;;FESTWERT b;WERT 9;;FESTWERT a;WERT 8;;TEXTSTRING c;WERT 3;;",
         "~ FESTWERT a 0>2 w0>0 1>8\n~ FESTWERT b 1>1 w0>0 2>9\n+ FESTWERT n ->0\n"},
        // Names that are there several times, in their order.
        {"FESTWERT a;WERT 1;;FESTWERT b;WERT 0;;FESTWERT a;WERT 2;;FESTWERT a;WERT 3;;",
         "FESTWERT a;WERT 1;;FESTWERT a;WERT 5;;FESTWERT b;WERT 0;;",
         "~ FESTWERT a 2>1 w0>0 2>5\n- FESTWERT a 3>-\n"},
        {"FESTWERT a;WERT 1;;", "FESTWERT a;WERT 1;;FESTWERT a;WERT 2;;", "+ FESTWERT a ->1\n"},
    };
    ExpectAll(cases);
}

TEST(Differences, TellOfFields)
{
    const Case cases[] = {
        {"KENNFELD a 1 1;LANGNAME \"l\";DISPLAYNAME d;FUNKTION f;EINHEIT_X \"x\";EINHEIT_Y \"y\";"
         "EINHEIT_W \"w\";*SSTX s;ST/X 1;ST/Y 1;WERT 1;;",
         "KENNFELD a 1 1;LANGNAME \"m\";DISPLAYNAME e;EINHEIT_X \"X\";EINHEIT_W \"W\";*SSTY s;"
         "ST/X 1;ST/Y 1;WERT 1;;",
         "~ KENNFELD a 0>0 LANGNAME 'l'>'m' DISPLAYNAME 'd'>'e' FUNKTION 'f'>'' EINHEIT_W 'w'>'W' "
         "EINHEIT_X 'x'>'X' EINHEIT_Y 'y'>'' *SSTX 's'>'' *SSTY ''>'s'\n"},
        {"FESTWERT a;LANGNAME \"l\";EINHEIT_W \"u\";WERT 1;;", "FESTWERT a;WERT 1;;",
         "~ FESTWERT a 0>0 EINHEIT_W 'u'>''\n", Ignoring(&Comparison::ignoreTexts)},
        {"FESTWERT a;LANGNAME \"l\";EINHEIT_W \"u\";WERT 1;;", "FESTWERT a;WERT 1;;",
         "~ FESTWERT a 0>0 LANGNAME 'l'>''\n", Ignoring(&Comparison::ignoreUnits)},
        // Counts where the points do not tell of them.
        {"KENNLINIE a 2;ST/X 1 2;WERT 1 2;;", "KENNLINIE a 3;ST/X 1 2;WERT 1 2;;",
         "~ KENNLINIE a 0>0 X '2'>'3'\n"},
        {"KENNLINIE a 2;ST/X 1 2;WERT 1 2;;", "KENNLINIE a 0;ST/X 1 2;WERT 1 2;;", ""},
        {"KENNFELD a 1 2;ST/X 1;ST/Y 1 2;WERT 1 2;;", "KENNFELD a 1 1;ST/X 1;ST/Y 1;WERT 1;;",
         "~ KENNFELD a 0>0 y1>- 2>[0] w1>- 2>[0]\n"},
        {"FESTWERTEBLOCK a 2 @ 2;WERT 1 2;WERT 3 4;;", "FESTWERTEBLOCK a 4;WERT 1 2 3 4;;",
         "~ FESTWERTEBLOCK a 0>0 X '2'>'0' Y '2'>'0'\n"},
        {"FESTWERTEBLOCK a 2 @ 2;WERT 1 2;WERT 3 4;;", "FESTWERTEBLOCK a 4;WERT 1 2 3 4;;", "",
         Ignoring(&Comparison::ignoreAxes)},
    };
    ExpectAll(cases);
}

TEST(Differences, TellOfValues)
{
    const Case cases[] = {
        {"FESTWERT a;WERT 0;;", "FESTWERT a;WERT -0.0;;", "~ FESTWERT a 0>0 w0>0 0>-0\n"},
        {"FESTWERT a;WERT 1;;", "FESTWERT a;TEXT \"1\";;", "~ FESTWERT a 0>0 w0>0 1>'1'\n"},
        {"FESTWERT a;TEXT \"t\";;", "FESTWERT a;TEXT \"T\";;", "~ FESTWERT a 0>0 w0>0 't'>'T'\n"},
        {"FESTWERT a;;", "FESTWERT a;WERT 0;;", "~ FESTWERT a 0>0 w->0 [0]>0\n"},
        {"FESTWERTEBLOCK a 3;WERT 1 2 3;;", "FESTWERTEBLOCK a 2;WERT 1 4;;",
         "~ FESTWERTEBLOCK a 0>0 w1>1 2>4 w2>- 3>[0]\n"},
        // Tolerances.
        {"FESTWERTEBLOCK a 3;WERT 1 100 -5;;", "FESTWERTEBLOCK a 3;WERT 1.5 100.5 -5.75;;",
         "~ FESTWERTEBLOCK a 0>0 w2>2 -5>-5.75\n", Absolute(0.5)},
        {"FESTWERTEBLOCK a 3;WERT 1 100 0;;", "FESTWERTEBLOCK a 3;WERT 1.5 101 -0.0;;",
         "~ FESTWERTEBLOCK a 0>0 w0>0 1>1.5\n", Relative(0.01)},
        {"FESTWERTEBLOCK a 3;WERT 1.#INF 1.#INF 1e308;;",
         "FESTWERTEBLOCK a 3;WERT 1.#INF 1 -1e308;;",
         "~ FESTWERTEBLOCK a 0>0 w1>1 inf>1 w2>2 1e+308>-1e+308\n", Relative(1.0)},
    };
    ExpectAll(cases);
}

TEST(Differences, CompareValuesAtEqualPoints)
{
    const Case cases[] = {
        {"KENNLINIE a 3;ST/X 1 2 3;WERT 10 20 30;;", "KENNLINIE a 2;ST/X 2 3;WERT 20 31;;",
         "~ KENNLINIE a 0>0 x0>- 1>[0] w0>- 10>[0] w2>1 30>31\n"},
        {"KENNLINIE a 3;ST/X 1 2 3;WERT 10 20 30;;", "KENNLINIE a 3;ST/X 1 2.5 3;WERT 10 20 31;;",
         "~ KENNLINIE a 0>0 x1>1 2>2.5 w1>- 20>[0] w2>2 30>31 w->1 [0]>20\n"},
        {"KENNLINIE a 3;ST/X 1 2 3;WERT 10 20 30;;", "KENNLINIE a 3;ST/X 1 2.5 3;WERT 10 20 31;;",
         "~ KENNLINIE a 0>0 w2>2 30>31\n", Ignoring(&Comparison::ignoreAxes)},
        // Points that change places, and points that are there twice.
        {"KENNLINIE a 2;ST_TX/X \"p\" \"q\";WERT 1 2;;",
         "KENNLINIE a 2;ST_TX/X \"q\" \"p\";WERT 2 1;;",
         "~ KENNLINIE a 0>0 x0>0 'p'>'q' x1>1 'q'>'p'\n"},
        {"KENNLINIE a 3;ST/X 1 1 2;WERT 1 2 3;;", "KENNLINIE a 4;ST/X 0 1 1 2;WERT 0 1 2 4;;",
         "~ KENNLINIE a 0>0 x->0 [0]>0 w2>3 3>4 w->0 [0]>0\n"},
        // Values beyond the axis.
        {"KENNLINIE a 1;ST/X 1;WERT 1 2;;", "KENNLINIE a 2;ST/X 0 1;WERT 0 1 3;;",
         "~ KENNLINIE a 0>0 X '1'>'2' x->0 [0]>0 w1>2 2>3 w->0 [0]>0\n"},
        {"KENNFELD a 2 2;ST/X 1 2;ST/Y 1 2;WERT 1 2 3 4 5;;",
         "KENNFELD a 3 2;ST/X 1 2 3;ST/Y 1 2;WERT 1 2 0 3 4 0 6;;",
         "~ KENNFELD a 0>0 x->2 [0]>3 w4>6 5>6 w->2 [0]>0 w->5 [0]>0\n"},
        // A tolerance makes points equal, on a falling axis as well.
        {"KENNLINIE a 2;ST/X 1 2;WERT 10 20;;", "KENNLINIE a 3;ST/X 0 1.01 2.01;WERT 0 10 20;;",
         "~ KENNLINIE a 0>0 x->0 [0]>0 w->0 [0]>0\n", Absolute(0.1)},
        {"KENNLINIE a 2;ST/X 2 1;WERT 20 10;;", "KENNLINIE a 3;ST/X 3 2.01 1.01;WERT 30 20 10;;",
         "~ KENNLINIE a 0>0 x->0 [0]>3 w->0 [0]>30\n", Absolute(0.1)},
        // A map with a column less and a row more.
        {"KENNFELD a 3 2;ST/X 1 2 3;ST/Y 1;WERT 11 12 13;ST/Y 2;WERT 21 22 23;;",
         "KENNFELD a 2 3;ST/X 1 3;ST/Y 1;WERT 11 13;ST/Y 1.5;WERT 0 0;ST/Y 2;WERT 21 24;;",
         "~ KENNFELD a 0>0 x1>- 2>[0] y->1 [0]>1.5 w1>- 12>[0] w4>- 22>[0] w5>5 23>24 "
         "w->2 [0]>0 w->3 [0]>0\n"},
        // Rows without points.
        {"FESTWERTEBLOCK a 2 @ 2;WERT 1 2;WERT 3 4;;",
         "FESTWERTEBLOCK a 3 @ 2;WERT 1 2 9;WERT 3 5 9;;",
         "~ FESTWERTEBLOCK a 0>0 X '2'>'3' w3>4 4>5 w->2 [0]>9 w->5 [0]>9\n"},
    };
    ExpectAll(cases);
    // A host's counts that make no rows.
    std::vector<Parameter> before = Read(cases[0].before);
    before[0].kind = dcm::Kind::kFestwerteblock;
    before[0].countX = 3;
    std::vector<Parameter> after = before;
    after[0].countX = 2;
    after[0].values[2] = 31.0;
    EXPECT_EQ(Show(dcm::Differences(before, after)), "~ FESTWERTEBLOCK a 0>0 w2>2 30>31\n");
}

TEST(Differences, TakeNoMoreTimeThanTheContent)
{
    // A map that claims much and holds little, axes of one point again and again, a name again and
    // again: any of them in quadratic time would not end here.
    constexpr std::size_t kMany = 200'000;
    Parameter map;
    map.kind = dcm::Kind::kKennfeld;
    map.x.points.assign(kMany, 1.0);
    map.y.points.assign(kMany, 2.0);
    map.values.assign(kMany, 3.0);
    Parameter other = map;
    other.x.points.back() = 4.0;
    Parameter rows;
    rows.kind = dcm::Kind::kFestwerteblock;
    rows.values.assign(3, 1.0);
    rows.countX = rows.countY = std::numeric_limits<std::int32_t>::max();
    Parameter shorter = rows;
    shorter.countX = 2;
    const Parameter before[] = {map, rows};
    const Parameter after[] = {other, shorter};
    const auto differences = dcm::Differences(before, after);
    ASSERT_EQ(differences.size(), 2U);
    EXPECT_EQ(differences[0].kind, dcm::Kind::kFestwerteblock);
    const std::vector<Parameter> many(kMany);
    EXPECT_EQ(dcm::Differences(std::span(many).first(kMany - 1), many).size(), 1U);
}
