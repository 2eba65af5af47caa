#include "tests/support.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>

using namespace test;

namespace {

/// What every kind of block has in common.
template <class Block>
void ExpectAttributes(const std::string& keyword, bool trimsFunktion)
{
    SCOPED_TRACE(keyword);
    const struct
    {
        std::string_view rest;
        std::string_view langname;
        std::string_view funktion;
    } cases[] = {
        {"\"a b\"", "a b", "\"a b\""},
        {" \"\" a\"b \" ", "a\"b", " \"\" a\"b \" "},
        {"", "", ""},
        {"a b", "a b", "a b"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.rest);
        const std::string rest(c.rest);
        auto block = Parsed<Block>(
            "\t displayname " + rest + "\n" + keyword + " N 1\n    LangName x\n LANGNAME " + rest +
            "\nLANGNAME\nLANGNAME\tx\nFUNKTION " + rest + "\nUNKNOWN x\nEND\nLANGNAME not read");
        EXPECT_EQ(block.GetDisplayname(), dcm::Widen(c.langname));
        EXPECT_EQ(block.GetLangname(), dcm::Widen(c.langname));
        EXPECT_EQ(block.GetFunction(), dcm::Widen(trimsFunktion ? c.langname : c.funktion));
    }
    // Only two of the parsers take tabs for white space around an attribute.
    const auto tabbed = Parsed<Block>("LANGNAME \t\"a\"\t\nFUNKTION \ta\t\n");
    EXPECT_EQ(tabbed.GetLangname(), trimsFunktion ? L"a" : L"\t\"a\"\t");
    EXPECT_EQ(tabbed.GetFunction(), trimsFunktion ? L"a" : L"\ta\t");

    // Texts without a line feed, or with one in front, are no block.
    for (const char* text : {"", "LANGNAME a", "\nLANGNAME a\n"})
        EXPECT_EQ(Parsed<Block>(text).GetLangname(), L"") << text;

    auto block = Parsed<Block>("ST/X 1\nST/Y 1\nWERT 1\n");
    block.SetName(L"N");
    const std::string bare = Written(block);
    EXPECT_TRUE(bare.starts_with(keyword + " N"));
    EXPECT_NE(bare.find("\n    LANGNAME \"\"\n"), bare.npos);
    EXPECT_EQ(bare.find("DISPLAYNAME"), bare.npos);
    EXPECT_EQ(bare.find("FUNKTION"), bare.npos);
    EXPECT_TRUE(bare.ends_with("\nEND\n\n"));
    block.GetLangname() = CString(L"two \"words\"");
    block.SetDisplayname(L"d");
    block.SetFunction(L"f g");
    EXPECT_NE(Written(block).find("\n    LANGNAME \"two \"words\"\"\n    DISPLAYNAME \"d\"\n"
                                  "    FUNKTION f g\n"),
              bare.npos);
    const auto again = Parsed<Block>(Written(block));
    EXPECT_EQ(again.GetLangname(), L"two \"words") << "a quote at the end is lost";
    EXPECT_EQ(again.GetFunction(), L"f g");
}

std::string ValueOf(const DCMFestwert& block)
{
    CComVariant value(L"old");
    return block.GetValue(&value) == S_OK ? Show(value) : "failed";
}

std::string ValueLine(const VARIANT& value)
{
    DCMFestwert block;
    block.SetValue(value);
    std::string text = Written(block);
    text.erase(0, std::string("FESTWERT \n    LANGNAME \"\"\n    ").size());
    return text.substr(0, text.find("\nEND\n\n"));
}

} // namespace

TEST(AllKinds, ReadAndWriteTheirAttributes)
{
    ExpectAttributes<DCMFestwert>("FESTWERT", true);
    ExpectAttributes<DCMTextstring>("TEXTSTRING", true);
    ExpectAttributes<DCMFestwerteblock>("FESTWERTEBLOCK", true);
    ExpectAttributes<DCMStuetzstellenverteilung>("STUETZSTELLENVERTEILUNG", false);
    ExpectAttributes<DCMKennlinie>("KENNLINIE", false);
    ExpectAttributes<DCMFestkennlinie>("FESTKENNLINIE", false);
    ExpectAttributes<DCMGruppenkennlinie>("GRUPPENKENNLINIE", false);
    ExpectAttributes<DCMKennfeld>("KENNFELD", false);
    ExpectAttributes<DCMFestkennfeld>("FESTKENNFELD", false);
    ExpectAttributes<DCMGruppenkennfeld>("GRUPPENKENNFELD", false);
}

TEST(Festwert, ReadsNameUnitAndValue)
{
    const struct
    {
        std::string_view block;
        std::wstring_view name;
        std::wstring_view unit;
        std::string_view value;
    } cases[] = {
        {"FESTWERT a b\n", L"a b", L"", "[0]"},
        {"WERT 2\nfestwert \" x \"\n", L"x", L"", "2"},
        {"FESTWERT\ta\n", L"", L"", "[0]"},
        {"TEXTSTRING a\nwert 3\n", L"", L"", "3"},
        {"EINHEIT_W \" \u00B0 \"\nEINHEIT_X \"x\"\n", L"", L"\u00C2\u00B0", "[0]"},
        {"EINHEIT_W \"\"\n", L"", L"", "[0]"},
        {"WERT 1 2\n", L"", L"", "1"},
        {"WERT \" 1\"\n", L"", L"", "1"},
        {"WERT abc\n", L"", L"", "0"},
        {"WERT \n", L"", L"", "0"},
        {"WERT\n", L"", L"", "[0]"},
        {"WERT -1.#inF\n", L"", L"", "-inf"},
        {"TEXT \"true\"\n", L"", L"", "1"},
        {"text false\n", L"", L"", "0"},
        {"TEXT \"True\"\n", L"", L"", "'True'"},
        {"TEXT \" true\"\n", L"", L"", "'true'"},
        {"TEXT \"  a  \"\n", L"", L"", "'a'"},
        {"TEXT \"\t\"a\\ \"b\" \" \"\n", L"", L"", "'a\\ \"b\" '"},
        {"TEXT \"\"\n", L"", L"", "''"},
        {"WERT 1\nTEXT a\n", L"", L"", "'a'"},
        {"TEXT a\nWERT 1\n", L"", L"", "1"},
        {"TEXT a\nTEXT\nEND", L"", L"", "'a'"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.block);
        const auto block = Parsed<DCMFestwert>(c.block);
        EXPECT_EQ(block.GetName(), c.name);
        EXPECT_EQ(block.GetUnit(), c.unit);
        EXPECT_EQ(ValueOf(block), c.value);
    }
    EXPECT_EQ(Parsed<DCMTextstring>("TEXTSTRING a\n").GetName(), L"a");
    EXPECT_EQ(Parsed<DCMTextstring>("FESTWERT a\n").GetName(), L"");
    // A second reading keeps what its lines do not name.
    auto block = Parsed<DCMFestwert>("FESTWERT a\nWERT 1\nEINHEIT_W s\n");
    EXPECT_EQ(block.Init(L"FESTWERT b\n"), S_OK);
    EXPECT_EQ(block.GetName(), L"b");
    EXPECT_EQ(ValueOf(block) + dcm::ToUtf8(block.GetUnit()), "1s");
}

TEST(Festwert, WritesTheWholeBlock)
{
    DCMFestwert number;
    number.SetName(L"Ignition_Offset");
    number.SetLangname(L"Ignition angle offset");
    number.SetFunction(L"IGN");
    number.SetUnit(L"deg");
    number.SetValue(CComVariant(-2.5));
    EXPECT_EQ(Written(number), "FESTWERT Ignition_Offset\n"
                               "    LANGNAME \"Ignition angle offset\"\n"
                               "    FUNKTION IGN\n"
                               "    EINHEIT_W \"deg\"\n"
                               "    WERT -2.5\n"
                               "END\n\n");
    DCMTextstring text;
    text.SetName(L"Variant");
    text.SetUnit(L" ");
    text.SetValue(CComVariant(L"Base"));
    const DCMFestwert copy(text);
    EXPECT_EQ(Written(text), "TEXTSTRING Variant\n    LANGNAME \"\"\n    EINHEIT_W \"\"\n"
                             "    TEXT \"Base\"\nEND\n\n");
    EXPECT_EQ(text.GetUnit(), L"");
    EXPECT_EQ(copy.GetUnit(), L" ");
    number = copy;
    EXPECT_TRUE(Written(number).starts_with("TEXTSTRING Variant\n"));
}

TEST(Festwert, WritesAValueOfAnyTag)
{
    constexpr double inf = std::numeric_limits<double>::infinity();
    VARIANT absent{};
    absent.vt = VT_BSTR;
    const struct
    {
        CComVariant value;
        std::string_view line;
    } cases[] = {
        {0.1, "WERT 0.10000000000000001"},
        {1e20, "WERT 1e+020"},
        {-inf, "WERT -1.#INF"},
        {L"a\r\nb\t\"c\"\\", "TEXT \"a..b\t\"c\"\\\""},
        {absent, "TEXT \"\""},
        {{}, "WERT 0.0"},
        {7, "WERT 7.0"},
        {short{-7}, "WERT -7.0"},
        {4000000000U, "WERT 4000000000.0"},
        {static_cast<signed char>(-1), "WERT -1.0"},
        {static_cast<unsigned char>(255), "WERT 255.0"},
        {static_cast<unsigned short>(65535), "WERT 65535.0"},
        {std::int64_t{-1} << 40, "WERT -1099511627776.0"},
        {~std::uint64_t{0}, "WERT 1.8446744073709552e+019"},
        {0.5F, "WERT 0.5"},
        {true, "WERT 1.0"},
        {false, "WERT 0.0"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.line);
        EXPECT_EQ(ValueLine(c.value), c.line);
    }
}

TEST(Festwert, GivesAndTakesCopiesOfItsValue)
{
    DCMFestwert block;
    EXPECT_EQ(block.GetValueType(), VT_EMPTY);
    EXPECT_EQ(block.GetValue(nullptr), E_POINTER);
    EXPECT_EQ(block.SetValue(nullptr), E_POINTER);
    CComVariant text(L"text");
    EXPECT_EQ(block.SetValue(text), S_OK);
    text.bstrVal[0] = L'n';
    EXPECT_EQ(ValueOf(block), "'text'");
    CComVariant given(L"released by the call");
    EXPECT_EQ(block.GetValue(&given), S_OK);
    given.bstrVal[0] = L'n';
    const DCMFestwert copy(block);
    block = *&block;
    EXPECT_EQ(ValueOf(block), "'text'");
    EXPECT_EQ(block.SetValue(CComVariant(3)), S_OK);
    EXPECT_EQ(block.GetValueType(), VT_I4);
    EXPECT_EQ(ValueOf(copy), "'text'");

    VARIANT bad{};
    bad.vt = 99;
    bad.lVal = 1;
    EXPECT_EQ(block.GetValue(&bad), DISP_E_BADVARTYPE);
    EXPECT_EQ(bad.vt, 99);
    EXPECT_THROW(block.SetValue(bad), dcm::ResultError);
    EXPECT_EQ(block.GetValueType(), VT_ERROR);
    EXPECT_EQ(ValueLine(text), "TEXT \"next\"");
}
