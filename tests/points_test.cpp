#include "tests/support.h"

#include <gtest/gtest.h>

#include <cstdint>

using namespace test;

namespace {

using Distribution = DCMStuetzstellenverteilung;

std::string Values(const Distribution& block)
{
    return Points(block, &Distribution::GetValues);
}

std::string Axis(const DCMKennlinie& block)
{
    return Points(block, &DCMKennlinie::GetAxis);
}

std::string Values(const DCMKennlinie& block)
{
    return Points(block, &DCMKennlinie::GetValues);
}

std::string AxisX(const DCMKennfeld& block)
{
    return Points(block, &DCMKennfeld::GetAxis_X);
}

std::string AxisY(const DCMKennfeld& block)
{
    return Points(block, &DCMKennfeld::GetAxis_Y);
}

std::string Values(const DCMKennfeld& block)
{
    return Points(block, &DCMKennfeld::GetValues);
}

VARIANT AbsentText()
{
    VARIANT variant{};
    variant.vt = VT_BSTR;
    return variant;
}

/// A map of `x` by `y` points with the values 1, 2, 3, ...
DCMKennfeld Map(int x, int y, int values)
{
    DCMKennfeld map;
    for (int i = 0; i < x; ++i)
        map.AddAxisX(CComVariant(i * 1.0));
    for (int i = 1; i <= y; ++i)
        map.AddAxisY(CComVariant(i * 10.0));
    for (int i = 1; i <= values; ++i)
        map.AddValue(CComVariant(i * 1.0));
    map.SetName(L"M");
    return map;
}

} // namespace

TEST(Distribution, ReadsNameUnitAndPoints)
{
    const struct
    {
        std::string_view block;
        std::wstring_view name;
        std::wstring_view unit;
        std::string_view points;
        VARTYPE type;
    } cases[] = {
        {"STUETZSTELLENVERTEILUNG A 3\n*SST\n", L"A", L"", "", VT_EMPTY},
        {"stuetzstellenverteilung  A\t \n", L"", L"", "", VT_EMPTY},
        {"STUETZSTELLENVERTEILUNG A b c\n", L"A", L"", "", VT_EMPTY},
        {"EINHEIT_X \" m/s\" \n", L"", L"m/s", "", VT_EMPTY},
        {"EINHEIT_X \"\tm\"\n", L"", L"\tm", "", VT_EMPTY},
        {"st/x 1  x 3\nWERT 4\n* ST/X 5\n", L"", L"", "1 0 3", VT_R8},
        {"ST/X 1.#INF\nST/X -1.#inf +.5e1\n", L"", L"", "inf -inf 5", VT_R8},
        {"ST/X 1\t2 \t3 \nST/X \n", L"", L"", "1 3", VT_R8},
        {"ST/X \"a b\" \"c\"\n", L"", L"", "'a b' 'c'", VT_BSTR},
        {"ST_TX/X 1 2\n", L"", L"", "1 2", VT_R8},
        {"ST_TX/X \"a\"\"b\"x\"\" \t\"\"\n", L"", L"", "'a' 'b' '' ' \t' ''", VT_BSTR},
        {"ST_TX/X \"\n", L"", L"", "''", VT_BSTR},
        {"ST_TX/X \"a\\\" \"b\"\n", L"", L"", "'a\\' 'b'", VT_BSTR},
        {"ST_TX/X \"a\" b\n", L"", L"", "0 0", VT_R8},
        {"ST/X 1\nST/X \"a\"\nST/X 2\n", L"", L"", "1 [10] [10]", VT_ERROR},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.block);
        const auto block = Parsed<Distribution>(c.block);
        EXPECT_EQ(block.GetName(), c.name);
        EXPECT_EQ(block.GetUnit(), c.unit);
        EXPECT_EQ(Values(block), c.points);
        EXPECT_EQ(block.GetValueType(), c.type);
    }
    for (const char* line : {"TEXT \"a\"\n", "st_tx/y 1\n"}) {
        SCOPED_TRACE(line);
        Distribution block;
        EXPECT_EQ(block.Init(dcm::Widen("ST/X 1\n" + std::string(line) + "ST/X 2\n")), E_FAIL);
        EXPECT_EQ(Values(block), "1");
    }
}

TEST(Distribution, KeepsOneTypeOfPoints)
{
    VARIANT reference{};
    reference.vt = 13;
    const struct
    {
        std::vector<CComVariant> added;
        std::string_view points;
        VARTYPE type;
    } cases[] = {
        {{1.0, L"a", 2.0}, "1 [10] [10]", VT_ERROR},
        {{L"a", AbsentText(), L""}, "'a' - ''", VT_BSTR},
        {{0.5F, 0.25F}, "[4] [4]", VT_R4},
        {{1, 2}, "[3] [3]", VT_I4},
        {{reference}, "[13]", 13},
        {{CComVariant(), 1.0, 1}, "[0] 1 [10]", VT_ERROR},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.points);
        Distribution block;
        for (const CComVariant& point : c.added)
            EXPECT_EQ(block.AddValue(point), S_OK);
        EXPECT_EQ(Values(block), c.points);
        EXPECT_EQ(block.GetValueType(), c.type);
        EXPECT_EQ(Values(Distribution(block)), c.points);
    }
    Distribution floats;
    floats.AddValue(0.5F);
    std::vector<CComVariant> points;
    floats.GetValues(points);
    EXPECT_EQ(points.at(0).fltVal, 0.5F);
    Distribution integers;
    integers.AddValue(7);
    integers.GetValues(points);
    EXPECT_EQ(points.at(0).llVal, 0) << "such a point has no value";
}

TEST(Distribution, WritesFivePointsALine)
{
    Distribution numbers;
    numbers.SetName(L"A");
    numbers.SetUnit(L"m/s");
    for (int i = 0; i < 7; ++i)
        numbers.AddValue(i / 2.0);
    numbers.AddValue(L"not written");
    EXPECT_EQ(Written(numbers), "STUETZSTELLENVERTEILUNG A 8\n*SST\n    LANGNAME \"\"\n"
                                "    EINHEIT_X \"m/s\"\n"
                                "    ST/X 0.0    0.5    1.0    1.5    2.0   \n"
                                "    ST/X 2.5    3.0   \nEND\n\n");
    Distribution texts;
    for (const CComVariant& text : {CComVariant(L"a\r\n\t\bz\v"), CComVariant(AbsentText()),
                                    CComVariant(L""), CComVariant(L"\"q"), CComVariant(L"e")})
        texts.AddValue(text);
    texts.SetUnit(L" ");
    EXPECT_EQ(Written(texts), "STUETZSTELLENVERTEILUNG  5\n*SST\n    LANGNAME \"\"\n"
                              "    EINHEIT_X \"\"\n"
                              "    ST_TX/X \"a....z\v\"  \"\"  \"\"  \"\"q\"  \"e\" \nEND\n\n");
    EXPECT_EQ(texts.GetUnit(), L"");
    EXPECT_EQ(Written(Distribution()), "STUETZSTELLENVERTEILUNG  0\n*SST\n    LANGNAME \"\"\n"
                                       "END\n\n");
    Distribution floats;
    floats.AddValue(0.5F);
    EXPECT_EQ(Written(floats).find("ST/X"), std::string::npos);
}

TEST(Curve, ReadsNameCountAndPoints)
{
    const struct
    {
        std::string_view block;
        std::wstring_view name;
        std::int32_t length;
        std::string_view axis;
        std::string_view values;
    } cases[] = {
        {"KENNLINIE K 4\n", L"K", 4, "", ""},
        {"Kennlinie  K  4x 5\n", L"K", 4, "", ""},
        {"KENNLINIE K\n", L"", 0, "", ""},
        {"KENNLINIE 7K\n", L"", 7, "", ""},
        {"KENNLINIE K -1\n", L"K", -1, "", ""},
        {"KENNLINIE K x\n", L"K", 0, "", ""},
        {"FESTKENNLINIE F 4\nST/X 1\n", L"", 0, "1", ""},
        {"ST/X 1 2 3\nWERT 4 5 6\nwert 7\n", L"", 0, "1 2 3", "4 5 6 7"},
        {"ST_TX/X  \"a\" \"b\" \nTEXT \"c d\"\n", L"", 0, "'a' 'b'", "'c d'"},
        {"ST/X \"a\"\nST_TX/X 1\nWERT \"a\"\nTEXT 1 a\nST/Y 1\n", L"", 0, "", ""},
        {"ST/X 1\nST_TX/X \"a\"\nST/X 2\nTEXT \"a\"\nWERT 1\n", L"", 0, "1 [10] [10]", "'a' [10]"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.block);
        const auto block = Parsed<DCMKennlinie>(c.block);
        EXPECT_EQ(block.GetName(), c.name);
        EXPECT_EQ(block.GetAxisLenghtX(), c.length);
        EXPECT_EQ(Axis(block), c.axis);
        EXPECT_EQ(Values(block), c.values);
    }
    DCMKennlinie block;
    EXPECT_EQ(block.Init(L"ST/X 1\nEINHEIT_X \"x\" \nEINHEIT_W  \"w\"\nst_tx/y \"a\"\nST/X 2\n"),
              E_FAIL);
    EXPECT_EQ(Axis(block), "1");
    EXPECT_EQ(block.GetAxisType(), VT_R8);
    EXPECT_EQ(block.GetValueType(), VT_EMPTY);
    EXPECT_EQ(block.GetUnit_X(), L"x");
    EXPECT_EQ(block.GetUnit_W(), L"w");
}

TEST(Curve, WritesAxisThenValues)
{
    DCMGruppenkennlinie curve;
    curve.SetName(L"K");
    curve.SetUnit_X(L" ");
    curve.SetUnit_W(L"Nm");
    for (int i = 0; i < 6; ++i)
        curve.AddAxis(CComVariant(i * 1.0));
    curve.AddValue(CComVariant(L"a\tb"));
    curve.AddValue(CComVariant(1.0));
    curve.SetSharedAxisUniqueName(L"Speed");
    // The host's own numbers are no part of the block, and their keywords know only one spelling.
    curve.AddValue(8.0, L"ST/X");
    curve.AddValue(9.0, L"WERT");
    for (const wchar_t* other : {L"st/x", L"Wert", L"TEXT"})
        curve.AddValue(7.0, other);
    EXPECT_EQ(ShowAll(curve.GetAxis()), "8");
    EXPECT_EQ(ShowAll(curve.GetValues()), "9");
    EXPECT_EQ(Axis(curve), "0 1 2 3 4 5");
    const std::string body =
        "    LANGNAME \"\"\n    EINHEIT_X \"\"\n    EINHEIT_W \"Nm\"\n*SSTX Speed\n"
        "    ST/X 0.0    1.0    2.0    3.0    4.0   \n    ST/X 5.0   \n"
        "    TEXT \"a.b\" \nEND\n\n";
    // A copy of the base's type keeps the keyword.
    DCMKennlinie copy(curve);
    EXPECT_EQ(Written(copy), "GRUPPENKENNLINIE K 2\n" + body);
    EXPECT_EQ(copy.GetUnit_X(), L"");
    copy = curve;
    copy.SetAxisLenghtX(9);
    EXPECT_EQ(Written(copy), "GRUPPENKENNLINIE K 9\n" + body);
    EXPECT_EQ(ShowAll(copy.GetAxis()), "8");

    copy.Init(L"*SSTX  Load \n");
    EXPECT_EQ(copy.GetStuetzstellenverteilung(), L"Load");
    EXPECT_NE(Written(copy).find("\n*SSTX Speed\n"), std::string::npos);
    auto read = Parsed<DCMGruppenkennlinie>("*SSTX Load\n");
    EXPECT_EQ(Written(read), "GRUPPENKENNLINIE  0\n    LANGNAME \"\"\nEND\n\n");
}

TEST(Map, ReadsNameCountsAndPoints)
{
    const struct
    {
        std::string_view block;
        std::wstring_view name;
        std::int32_t x, y;
    } first[] = {
        {"KENNFELD K 4 3\n", L"K", 4, 3},    {"kennfeld  K  4   3  2\n", L"K", 4, 3},
        {"KENNFELD K 4\n", L"K", 0, 4},      {"KENNFELD K\n", L"", 0, 0},
        {"KENNFELD 5\n", L"", 0, 5},         {"FESTKENNFELD K 4 3\n", L"", 0, 0},
        {"KENNFELD K 4x -3\n", L"K", 4, -3},
    };
    for (const auto& c : first) {
        SCOPED_TRACE(c.block);
        const auto map = Parsed<DCMKennfeld>(std::string(c.block) + "ST/X 1\n");
        EXPECT_EQ(map.GetName(), c.name);
        EXPECT_EQ(map.GetAxisLenghtX(), c.x);
        EXPECT_EQ(map.GetAxisLenghtY(), c.y);
        EXPECT_EQ(AxisX(map), "1");
    }
    const struct
    {
        std::string_view lines;
        std::string_view x;
        std::string_view y;
        std::string_view values;
    } points[] = {
        {"ST/X 1 2 3\nST/Y 10\nWERT 1 2 3\nST/Y 20\nwert 4 5 6\n", "1 2 3", "10 20", "1 2 3 4 5 6"},
        {"ST_TX/X \"a\"\nST_TX/Y \"b\" \"c\"\nTEXT \"d\"\n", "'a'", "'b' 'c'", "'d'"},
        {"ST/X \"a\"\nST/Y \"a\"\nWERT \"a\"\nST_TX/X 1\nST_TX/Y 1\nTEXT 1\n", "", "", ""},
        {"ST/Y 1.#INF\nST_TX/Y \"a\"\nWERT -1.#Inf x\nTEXT \"a\"\n", "", "inf [10]", "-inf 0 [10]"},
    };
    for (const auto& c : points) {
        SCOPED_TRACE(c.lines);
        const auto map = Parsed<DCMKennfeld>(c.lines);
        EXPECT_EQ(AxisX(map), c.x);
        EXPECT_EQ(AxisY(map), c.y);
        EXPECT_EQ(Values(map), c.values);
    }
    auto map =
        Parsed<DCMGruppenkennfeld>("EINHEIT_X \"x\"\nEINHEIT_Y \" y \"\nEINHEIT_W w\n*SSTX  A \n"
                                   "*SSTY B\nST/X 1\nST/Y 2\nWERT 3\n");
    EXPECT_EQ(map.GetUnit_X() + map.GetUnit_Y() + map.GetUnit_W(), L"xyw");
    EXPECT_EQ(map.GetStuetzstellenverteilungX() + map.GetStuetzstellenverteilungY(), L"AB");
    EXPECT_EQ(Written(map).find("*SST"), std::string::npos);
    EXPECT_EQ(map.GetAxis_XType(), VT_R8);
    EXPECT_EQ(map.GetAxis_YType(), VT_R8);
    EXPECT_EQ(map.GetValueType(), VT_R8);
}

TEST(Map, WritesRowsUnderTheirYPoints)
{
    const std::string head = "    LANGNAME \"\"\n";
    const struct
    {
        int x, y, values;
        std::string text;
    } shapes[] = {
        {3, 2, 6,
         "KENNFELD M 3 2\n" + head +
             "    ST/X 0.0    1.0    2.0   \n    ST/Y 10.0   \n"
             "    WERT 1.0    2.0    3.0   \n    ST/Y 20.0   \n    WERT 4.0    5.0    6.0   "
             "\nEND\n\n"},
        {3, 2, 5, ""},
        {2, 1, 5,
         "KENNFELD M 2 1\n" + head +
             "    ST/X 0.0    1.0   \n    ST/Y 10.0   \n    WERT 1.0    2.0   \nEND\n\n"},
        {6, 1, 6,
         "KENNFELD M 6 1\n" + head +
             "    ST/X 0.0    1.0    2.0    3.0    4.0   \n    ST/X 5.0   \n"
             "    ST/Y 10.0   \n    WERT 1.0    2.0    3.0    4.0    5.0   \n    WERT 6.0   "
             "\nEND\n\n"},
        {2, 0, 3, "KENNFELD M 2 0\n" + head + "    ST/X 0.0    1.0   \nEND\n\n"},
        {0, 2, 3, "KENNFELD M 0 2\n" + head + "    ST/Y 10.0   \n    ST/Y 20.0   \nEND\n\n"},
        {0, 0, 3, ""},
    };
    for (const auto& c : shapes) {
        SCOPED_TRACE(testing::Message() << c.x << " by " << c.y << ": " << c.values);
        DCMKennfeld map = Map(c.x, c.y, c.values);
        map.RotateMap();
        EXPECT_EQ(Written(map), c.text);
    }
    DCMFestkennfeld map;
    map.SetName(L"F");
    for (const wchar_t* x : {L"a\n", L"b"})
        map.AddAxisX(CComVariant(x));
    for (const wchar_t* y : {L"\b", L"d"})
        map.AddAxisY(CComVariant(y));
    map.AddAxisY(CComVariant(1));
    // From the second value on there is no number, but each keeps its place.
    for (const CComVariant& value : {CComVariant(1.0), CComVariant(L"x"), CComVariant(2.0),
                                     CComVariant(3.0), CComVariant(4.0), CComVariant(5.0)})
        map.AddValue(value);
    map.SetUnit_X(L" ");
    map.SetUnit_Y(L"\u00B0");
    map.SetUnit_W(L" ");
    map.SetSharedXAxisUniqueName(L"A");
    map.SetSharedYAxisUniqueName(L"B");
    map.SetAxisLenghtX(8);
    map.SetAxisLenghtY(6);
    EXPECT_EQ(
        Written(map),
        "FESTKENNFELD F 8 6\n" + head +
            "    EINHEIT_X \"\"\n    EINHEIT_Y \"\xB0\"\n    EINHEIT_W \"\"\n*SSTX A\n*SSTY B\n"
            "    ST_TX/X \"a.\"  \"b\" \n    ST_TX/Y \".\" \n    WERT 1.0   \n"
            "    ST_TX/Y \"d\" \nEND\n\n");
    EXPECT_TRUE(map.GetUnit_X().IsEmpty() && map.GetUnit_W().IsEmpty());
    EXPECT_EQ(Values(map), "1 [10] [10] [10] [10] [10]");

    DCMKennfeld rows = Map(1, 0, 0);
    rows.AddAxisY(CComVariant(1.0));
    rows.AddAxisY(CComVariant(L"a"));
    rows.AddValue(CComVariant(L"v"));
    rows.AddValue(CComVariant(L"w"));
    EXPECT_EQ(Written(rows), "KENNFELD M 1 2\n" + head +
                                 "    ST/X 0.0   \n    ST/Y 1.0   \n"
                                 "    TEXT \"v\" \n    TEXT \"w\" \nEND\n\n");
}

TEST(Points, HaveTextsOfTheirOwnInEachCopy)
{
    std::vector<CComVariant> points;
    {
        DCMKennfeld map;
        map.AddAxisX(CComVariant(L"axis"));
        DCMKennfeld copy(map);
        copy = *&copy;
        copy.GetAxis_X(points);
        points[0].bstrVal[0] = L'A';
        EXPECT_EQ(AxisX(map) + AxisX(copy), "'axis''axis'");
        map = DCMKennfeld();
        EXPECT_EQ(AxisX(copy), "'axis'");
    }
    EXPECT_EQ(ShowAll(points), "'Axis'") << "it outlives the block";
}
