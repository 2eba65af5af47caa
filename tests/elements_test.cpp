// What a host sets in a block, gets from it and finds in the file. How a block's text is read is
// tested in blocks_test.cpp.
#include "tests/support.h"

#include <gtest/gtest.h>

#include <bit>
#include <chrono>
#include <cstdint>
#include <tuple>

using namespace test;

namespace {

/// A variant of this tag, its content zero unless told.
VARIANT Tagged(VARTYPE tag, std::int64_t content = 0)
{
    VARIANT variant{};
    variant.vt = tag;
    variant.llVal = content;
    return variant;
}

/// The private members that read and compose lines.
auto PrivateMembers();

/// An explicit instantiation may name private members.
template <auto... Members>
struct PrivateMember
{
    friend auto PrivateMembers() { return std::tuple(Members...); }
};

template struct PrivateMember<&DCMFestwerteblock::AddValues, &DCMFestwerteblock::AddStringValues,
                              &DCMFestwerteblock::ExportValues,
                              &DCMStuetzstellenverteilung::AddValues,
                              &DCMStuetzstellenverteilung::ExportValues, &DCMKennlinie::AddValues,
                              &DCMKennlinie::ExportValues>;

} // namespace

TEST(Blocks, ReadAndComposeTheirLines)
{
    const auto [addToList, addTexts, listLines, addPoints, pointLines, addToCurve, curveLines] =
        PrivateMembers();
    PravFile file;
    CString numbers(L"1 x"), texts(L"\"a\" \"b\""), unquoted(L"c"), none;
    DCMFestwerteblock list;
    EXPECT_EQ((list.*addToList)(texts), S_OK);
    EXPECT_EQ((list.*addTexts)(unquoted), S_OK);
    EXPECT_EQ((list.*listLines)(file), L"    TEXT \"a\"    \"b\"   \n");
    list.AddValue(0.1);
    EXPECT_EQ((list.*addToList)(numbers), S_OK);
    EXPECT_EQ((list.*listLines)(file), L"    WERT 0.10000000000000001    1.0    0.0   \n");
    list.SetXValueCount(2);
    EXPECT_EQ((list.*listLines)(file), L"    WERT 0.10000000000000001    1.0    0.0   \n");
    list.SetYValueCount(1);
    EXPECT_EQ((list.*listLines)(file), L"    WERT 0.1    1.0   \n    WERT 0.0   \n");
    EXPECT_THROW((list.*addToList)(none), dcm::ResultError);
    EXPECT_EQ(numbers + texts + unquoted, L"") << "what is read is taken";

    CString points(L"1 2"), more(L"\"a\""), values(L"3"), dropped(L"4");
    DCMStuetzstellenverteilung distribution;
    EXPECT_EQ((distribution.*addPoints)(points), S_OK);
    EXPECT_EQ((distribution.*pointLines)(file), L"    ST/X 1.0    2.0   \n");
    DCMKennlinie curve;
    EXPECT_EQ((curve.*addToCurve)(more, L"ST_TX/X"), S_OK);
    EXPECT_EQ((curve.*addToCurve)(values, L"wert"), S_OK);
    EXPECT_EQ((curve.*addToCurve)(dropped, L"TEXT"), S_OK);
    EXPECT_EQ((curve.*curveLines)(file), L"    ST_TX/X \"a\" \n    WERT 3.0   \n");
    EXPECT_EQ(points + more + values + dropped, L"");
}

TEST(Blocks, WriteWhatTheHostSets)
{
    ForEachKind([](const std::string& keyword, auto get, auto) {
        SCOPED_TRACE(keyword);
        BlockOf<decltype(get)> block;
        constexpr bool kCurve = std::is_base_of_v<DCMKennlinie, decltype(block)>;
        constexpr bool kMap = std::is_base_of_v<DCMKennfeld, decltype(block)>;
        constexpr bool kAxis = std::is_base_of_v<DCMStuetzstellenverteilung, decltype(block)>;
        block.SetName(L"n");
        block.SetLangname(L"l");
        block.SetDisplayname(L"d");
        block.SetFunction(L"f");
        std::string counts, units;
        if constexpr (kCurve || kMap) {
            block.SetUnit_X(L" ");
            block.SetUnit_W(L" ");
            block.SetAxisLenghtX(1);
            counts = kMap ? " 1 1\n" : " 1\n";
        } else {
            block.SetUnit(L" ");
        }
        if constexpr (kMap) {
            // A map without values is not written.
            block.Init(L"ST/X 1 2\nST/Y 1 2\nWERT 1 2 3 4\n");
            block.SetUnit_Y(L" ");
            block.SetAxisLenghtY(1);
        }
        for (const auto& [written, line] :
             {std::pair(kCurve || kMap || kAxis, "    EINHEIT_X \"\"\n"),
              {kMap, "    EINHEIT_Y \"\"\n"},
              {!kAxis, "    EINHEIT_W \"\"\n"}})
            units += written ? line : "";
        const std::string first = Written(block);
        EXPECT_EQ(first.find(keyword + " n" + counts), 0U) << first;
        EXPECT_NE(first.find("    LANGNAME \"l\"\n    DISPLAYNAME \"d\"\n    FUNKTION f\n" + units),
                  first.npos)
            << first;
        EXPECT_EQ(Written(block), Replaced(first, units, "")) << "a unit of one blank counts once";
    });
}

TEST(Festwert, WritesAValueOfAnyTag)
{
    const std::tuple<CComVariant, VARTYPE, std::string> cases[] = {
        {0.1, VT_R8, "WERT 0.10000000000000001"},
        {CComVariant(), VT_EMPTY, "WERT 0.0"},
        {L"a\r\nb\t\"c\"\\", VT_BSTR, "TEXT \"a..b\t\"c\"\\\""},
        {Tagged(VT_BSTR), VT_BSTR, "TEXT \"\""},
        {7, VT_I4, "WERT 7.0"},
        {4000000000U, VT_UI4, "WERT 4000000000.0"},
        {static_cast<signed char>(-1), VT_I1, "WERT -1.0"},
        {std::uint8_t{255}, VT_UI1, "WERT 255.0"},
        {std::int16_t{-2}, VT_I2, "WERT -2.0"},
        {std::uint16_t{65535}, VT_UI2, "WERT 65535.0"},
        {-(std::int64_t{1} << 40), VT_I8, "WERT -1099511627776.0"},
        {~std::uint64_t{0}, VT_UI8, "WERT 1.8446744073709552e+019"},
        {0.5F, VT_R4, "WERT 0.5"},
        {true, VT_BOOL, "WERT 1.0"},
        {Tagged(VT_DATE, std::bit_cast<std::int64_t>(-45678.75)), VT_DATE, "WERT -45678.75"},
        {Tagged(VT_CY, -12'345'678), VT_CY, "WERT -1234.5678"},
        {Tagged(VT_NULL, -1), VT_NULL, "WERT 0.0"}};
    for (const auto& [value, tag, line] : cases) {
        DCMTextstring block;
        block.SetUnit(L" ");
        EXPECT_EQ(block.SetValue(value), S_OK);
        EXPECT_EQ(block.SetValue(nullptr), E_POINTER);
        EXPECT_EQ(block.GetValue(nullptr), E_POINTER);
        EXPECT_EQ(block.GetValueType(), tag);
        EXPECT_EQ(Written(block),
                  "TEXTSTRING \n    LANGNAME \"\"\n    EINHEIT_W \"\"\n    " + line + "\nEND\n\n");
    }
}

TEST(Festwert, TakesAPlainNumber)
{
    DCMFestwert block;
    // A literal zero is a null pointer too.
    EXPECT_EQ(block.SetValue(0), S_OK);
    EXPECT_EQ(block.GetValueType(), VT_I4);
    EXPECT_EQ(block.SetValue(2.5), S_OK);
    EXPECT_EQ(Written(block), "FESTWERT \n    LANGNAME \"\"\n    WERT 2.5\nEND\n\n");
}

TEST(Festwerteblock, WritesWhatTheHostAdds)
{
    DCMFestwerteblock block;
    block.SetXValueCount(1);
    block.SetYValueCount(2);
    block.AddValue(CString(L"a\r\n\t"));
    const std::string head = "FESTWERTEBLOCK  1 @ 2\n    LANGNAME \"\"\n";
    EXPECT_EQ(Written(block), head + "    TEXT \"a..\t\"   \nEND\n\n");
    block.AddValue(0.1);
    EXPECT_EQ(Written(block), head + "    WERT 0.1   \nEND\n\n");
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

TEST(Points, KeepOneType)
{
    const std::tuple<std::vector<CComVariant>, std::string, VARTYPE, std::string> cases[] = {
        {{L"a\r\n\t\bz\v", Tagged(VT_BSTR), L"\"q"},
         "'a\r\n\t\bz\v' - '\"q'",
         VT_BSTR,
         "3\n*    ST_TX/X \"a....z\v\"  \"\"  \"\"q\" \n"},
        {{0.5F, 0.25F}, "[4]= [4]=", VT_R4, "2\n*"},
        {{CComVariant(), 1.0, 1}, "[0] 1 [10]", VT_ERROR, "3\n*    ST/X 1.0   \n"}};
    for (const auto& [added, points, type, written] : cases) {
        DCMStuetzstellenverteilung block;
        for (const CComVariant& point : added)
            EXPECT_EQ(block.AddValue(point), S_OK);
        EXPECT_EQ(Points(block, &DCMStuetzstellenverteilung::GetValues), points);
        EXPECT_EQ(block.GetValueType(), type);
        EXPECT_EQ(Written(block), "STUETZSTELLENVERTEILUNG  " +
                                      Replaced(written, "*", "*SST\n    LANGNAME \"\"\n") +
                                      "END\n\n");
    }
}

TEST(Curve, KeepsTwoStoresAndTwoNames)
{
    DCMGruppenkennlinie curve;
    curve.Init(L"GRUPPENKENNLINIE K 0\n*SSTX Load\nST/X 0\nTEXT \"a\"\n");
    EXPECT_EQ(curve.GetAxisType() + curve.GetValueType(), VT_R8 + VT_BSTR);
    // The host's own numbers are not part of the block, and their keywords have only one spelling.
    for (const wchar_t* keyword : {L"ST/X", L"WERT", L"st/x", L"Wert", L"TEXT"})
        curve.AddValue(8.0, keyword);
    curve.AddAxis(CComVariant(1.0));
    curve.AddValue(CComVariant(1.0));
    curve.SetUnit_X(L" ");
    curve.SetUnit_W(L" ");
    curve.SetAxisLenghtX(9);
    curve.SetSharedAxisUniqueName(L"Speed");
    // A copy of the base's type keeps keyword, units and lists.
    const DCMKennlinie copy(curve);
    EXPECT_EQ(Written(DCMKennlinie(copy)),
              "GRUPPENKENNLINIE K 9\n    LANGNAME \"\"\n    EINHEIT_X \"\"\n    EINHEIT_W \"\"\n"
              "*SSTX Speed\n    ST/X 0.0    1.0   \n    TEXT \"a\" \nEND\n\n");
    EXPECT_EQ(Written(curve), Written(DCMKennlinie(copy)));
    EXPECT_EQ(curve.GetUnit_X() + copy.GetUnit_X() + curve.GetUnit_W() + copy.GetUnit_W(), L"  ");
    EXPECT_EQ(copy.GetStuetzstellenverteilung(), L"Load");
    EXPECT_EQ(ShowAll(copy.GetAxis()) + " " + ShowAll(copy.GetValues()), "8 8");
}

TEST(Map, WritesWhatTheHostSets)
{
    DCMFestkennfeld map;
    map.AddAxisX(CComVariant(L"a\n\t\r\b"));
    for (const CComVariant& value : {CComVariant(1.0), CComVariant(2.0), CComVariant(3)}) {
        map.AddAxisY(value);
        map.AddValue(value);
    }
    EXPECT_EQ(map.GetAxis_XType(), VT_BSTR);
    EXPECT_EQ(map.GetAxis_YType() + map.GetValueType(), VT_ERROR + VT_ERROR);
    map.SetUnit_X(L" ");
    map.SetUnit_Y(L"\u00B0");
    map.SetUnit_W(L" ");
    map.SetSharedXAxisUniqueName(L"A");
    map.SetSharedYAxisUniqueName(L"B");
    map.SetAxisLenghtX(8);
    map.SetAxisLenghtY(6);
    map.RotateMap();
    EXPECT_EQ(Written(map), "FESTKENNFELD  8 6\n    LANGNAME \"\"\n    EINHEIT_X \"\"\n"
                            "    EINHEIT_Y \"\xB0\"\n    EINHEIT_W \"\"\n*SSTX A\n*SSTY B\n"
                            "    ST_TX/X \"a....\" \n    ST/Y 1.0   \n    WERT 1.0   \n"
                            "    ST/Y 2.0   \n    WERT 2.0   \nEND\n\n");
}

TEST(Map, GivesItsPartsToAClassOfTheHost)
{
    struct HostMap : DCMKennfeld
    {
        using DCMKennfeld::AddValues, DCMKennfeld::ExportLangname, DCMKennfeld::ExportDisplayname;
        using DCMKennfeld::ExportFunktion, DCMKennfeld::ExportValues;
    } map;
    PravFile file;
    // More bytes than characters, in whatever code page.
    for (const wchar_t* c : {L"\u00E4", L"\u20AC"}) {
        CString name;
        for (int i = 0; i < 2000; ++i)
            name += c;
        map.SetLangname(name);
        EXPECT_EQ(map.ExportLangname(file), L"    LANGNAME \"" + name + L"\"\n");
    }
    map.Init(L"LANGNAME l\nDISPLAYNAME d\nFUNKTION f\nST/X 1\nST/Y 1\n");
    EXPECT_EQ(map.AddValues(L"2", L"WERT"), S_OK);
    EXPECT_EQ(map.ExportLangname(file) + map.ExportDisplayname(file) + map.ExportFunktion(file),
              L"    LANGNAME \"l\"\n    DISPLAYNAME \"d\"\n    FUNKTION f\n");
    EXPECT_EQ(map.ExportValues(file), L"    ST/X 1.0   \n    ST/Y 1.0   \n    WERT 2.0   \n");
}

TEST(Map, KeepsEveryCharacterOfTheHost)
{
    // Characters of one to four bytes, halves of pairs, and numbers that no character has.
    CString name(L"m\u00E4\u20AC\u0131");
    for (const std::uint32_t c : {0x1F600U, 0xD800U, 0xDFFFU, 0xFFFFU, 0x7FFFFFFFU, 0xFFFFFFFFU})
        name += CString(std::wstring(1, static_cast<wchar_t>(c)));
    DCMKennfeld map;
    map.Init(L"KENNFELD " + name + L" 2 1\nEINHEIT_X " + name + L"\n");
    EXPECT_EQ(map.GetName(), name);
    EXPECT_EQ(map.GetUnit_X(), name);
}
