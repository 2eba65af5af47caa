#include "tests/support.h"

#include <gtest/gtest.h>

#include <tuple>
#include <vector>

using namespace test;

namespace {

using Distribution = DCMStuetzstellenverteilung;

/// A variant without a value.
VARIANT Tagged(VARTYPE tag)
{
    VARIANT variant{};
    variant.vt = tag;
    return variant;
}

std::string AxisX(const DCMKennfeld& map)
{
    return Points(map, &DCMKennfeld::GetAxis_X);
}

} // namespace

TEST(Points, KeepOneType)
{
    const std::string item = "    ST/X 1.0   \n";
    const std::tuple<std::vector<CComVariant>, std::string, VARTYPE, std::string> cases[] = {
        {{1.0, L"a", 2.0}, "1 [10] [10]", VT_ERROR, "3" + item},
        {{L"a\r\n\t\bz\v", Tagged(VT_BSTR), L"", L"\"q"},
         "'a\r\n\t\bz\v' - '' '\"q'",
         VT_BSTR,
         "4    ST_TX/X \"a....z\v\"  \"\"  \"\"  \"\"q\" \n"},
        {{0.5F, 0.25F}, "[4] [4]", VT_R4, "2"},
        {{1, 2}, "[3] [3]", VT_I4, "2"},
        {{Tagged(13)}, "[13]", 13, "1"},
        {{CComVariant(), 1.0, 1}, "[0] 1 [10]", VT_ERROR, "3" + item}};
    for (const auto& [added, points, type, written] : cases) {
        Distribution block;
        for (const CComVariant& point : added)
            EXPECT_EQ(block.AddValue(point), S_OK);
        EXPECT_EQ(Points(block, &Distribution::GetValues), points);
        EXPECT_EQ(block.GetValueType(), type);
        const std::string text = Replaced(Written(block), "\n*SST\n    LANGNAME \"\"\n", "");
        EXPECT_EQ(text, "STUETZSTELLENVERTEILUNG  " + written + "END\n\n");
    }
    Distribution floats, integers;
    floats.AddValue(0.5F);
    integers.AddValue(7);
    std::vector<CComVariant> points;
    floats.GetValues(points);
    EXPECT_EQ(points.at(0).fltVal, 0.5F);
    integers.GetValues(points);
    EXPECT_EQ(points.at(0).llVal, 0) << "such a point has no value";
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

TEST(Curve, KeepsTwoStoresAndTwoNames)
{
    DCMGruppenkennlinie curve;
    curve.Init(L"GRUPPENKENNLINIE K 0\n*SSTX Load\nST/X 0\nTEXT \"a\"\nEINHEIT_X x\n");
    EXPECT_EQ(curve.GetAxisType(), VT_R8);
    EXPECT_EQ(curve.GetValueType(), VT_BSTR);
    // The host's own numbers are no part of the block, and their keywords know only one spelling.
    curve.AddValue(8.0, L"ST/X");
    curve.AddValue(9.0, L"WERT");
    for (const wchar_t* other : {L"st/x", L"Wert", L"TEXT"})
        curve.AddValue(7.0, other);
    EXPECT_EQ(ShowAll(curve.GetAxis()) + " " + ShowAll(curve.GetValues()), "8 9");
    EXPECT_EQ(Points(curve, PointsOfCurve(&DCMKennlinie::GetAxis)), "0");
    curve.AddAxis(CComVariant(1.0));
    curve.AddValue(CComVariant(1.0));
    curve.SetUnit_X(L" ");
    curve.SetUnit_W(L" ");
    const DCMKennlinie copy(curve);
    const std::string head =
        "GRUPPENKENNLINIE K 2\n    LANGNAME \"\"\n    EINHEIT_X \"\"\n    EINHEIT_W \"\"\n";
    const std::string body = "    ST/X 0.0    1.0   \n    TEXT \"a\" \nEND\n\n";
    EXPECT_EQ(Written(curve), head + body);
    EXPECT_EQ(curve.GetUnit_X() + curve.GetUnit_W(), L"");
    // A copy of the base's type keeps keyword, units and lists.
    EXPECT_EQ(Written(DCMKennlinie(copy)), head + body);
    EXPECT_EQ(copy.GetUnit_X() + copy.GetUnit_W(), L"  ");
    EXPECT_EQ(ShowAll(copy.GetAxis()), "8");
    DCMKennlinie assigned;
    assigned = copy;
    assigned.SetSharedAxisUniqueName(L"Speed");
    EXPECT_EQ(Written(assigned), head + "*SSTX Speed\n" + body);
    EXPECT_EQ(assigned.GetStuetzstellenverteilung(), L"Load");
    assigned.SetAxisLenghtX(9);
    EXPECT_TRUE(Written(assigned).starts_with("GRUPPENKENNLINIE K 9\n"));
}

TEST(Map, WritesWhatTheHostSets)
{
    DCMFestkennfeld map;
    map.SetName(L"F");
    map.AddAxisX(CComVariant(L"a\n\t\r\b"));
    map.AddAxisY(CComVariant(2.0));
    map.AddAxisY(CComVariant(1));
    for (const CComVariant& value : {CComVariant(1.0), CComVariant(2.0), CComVariant(3)})
        map.AddValue(value);
    EXPECT_EQ(map.GetAxis_XType(), VT_BSTR);
    EXPECT_EQ(map.GetAxis_YType(), VT_ERROR);
    EXPECT_EQ(map.GetValueType(), VT_ERROR);
    map.SetUnit_X(L" ");
    map.SetUnit_Y(L"\u00B0");
    map.SetUnit_W(L" ");
    map.SetSharedXAxisUniqueName(L"A");
    map.SetSharedYAxisUniqueName(L"B");
    map.SetAxisLenghtX(8);
    map.SetAxisLenghtY(6);
    map.RotateMap();
    DCMKennfeld copy;
    copy = map;
    const std::string text = "FESTKENNFELD F 8 6\n    LANGNAME \"\"\n    EINHEIT_X \"\"\n"
                             "    EINHEIT_Y \"\xB0\"\n    EINHEIT_W \"\"\n*SSTX A\n*SSTY B\n"
                             "    ST_TX/X \"a....\" \n    ST/Y 2.0   \n    WERT 1.0   \n"
                             "    WERT 2.0   \nEND\n\n";
    EXPECT_EQ(Written(map), text);
    EXPECT_EQ(map.GetUnit_X() + map.GetUnit_Y() + map.GetUnit_W(), L"\u00B0");
    EXPECT_EQ(Written(copy), text);
    EXPECT_EQ(copy.GetStuetzstellenverteilungX() + copy.GetStuetzstellenverteilungY(), L"");
}
