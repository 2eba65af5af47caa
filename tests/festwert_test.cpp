#include "tests/support.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <utility>

using namespace test;

namespace {

std::string ValueOf(const DCMFestwert& block)
{
    CComVariant value(L"old");
    return block.GetValue(&value) == S_OK ? Show(value) : "failed";
}

} // namespace

TEST(Festwert, WritesAValueOfAnyTag)
{
    VARIANT absent{};
    absent.vt = VT_BSTR;
    const std::pair<CComVariant, std::string> cases[] = {
        {0.1, "WERT 0.10000000000000001"},

        {CComVariant(), "WERT 0.0"},
        {L"a\r\nb\t\"c\"\\", "TEXT \"a..b\t\"c\"\\\""},
        {absent, "TEXT \"\""},
        {7, "WERT 7.0"},

        {4000000000U, "WERT 4000000000.0"},
        {static_cast<signed char>(-1), "WERT -1.0"},
        {std::uint8_t{255}, "WERT 255.0"},

        {-(std::int64_t{1} << 40), "WERT -1099511627776.0"},
        {~std::uint64_t{0}, "WERT 1.8446744073709552e+019"},
        {0.5F, "WERT 0.5"},
        {true, "WERT 1.0"},
        {false, "WERT 0.0"}};
    for (const auto& [value, line] : cases) {
        DCMTextstring block;
        EXPECT_EQ(block.SetValue(value), S_OK);
        EXPECT_EQ(block.GetValueType(), value.vt);
        EXPECT_EQ(Written(block), "TEXTSTRING \n    LANGNAME \"\"\n    " + line + "\nEND\n\n");
    }
}

TEST(Festwert, WritesABlankUnitAsAnEmptyOne)
{
    DCMTextstring text;
    text.SetName(L"a");
    text.SetUnit(L" ");
    DCMFestwert copy;
    EXPECT_TRUE(Written(copy).starts_with("FESTWERT \n"));
    copy = text;
    EXPECT_EQ(Written(text),
              "TEXTSTRING a\n    LANGNAME \"\"\n    EINHEIT_W \"\"\n    WERT 0.0\nEND\n\n");
    EXPECT_EQ(text.GetUnit(), L"");
    EXPECT_EQ(copy.GetUnit(), L" ");
    // What a second block names replaces, the rest stays; the keyword came with the copy.
    EXPECT_EQ(copy.Init(L"TEXTSTRING b\n"), S_OK);
    EXPECT_EQ(copy.GetName() + copy.GetUnit(), L"b ");
}

TEST(Festwert, GivesAndTakesCopiesOfItsValue)
{
    DCMFestwert block;
    EXPECT_EQ(block.GetValue(nullptr), E_POINTER);
    EXPECT_EQ(block.SetValue(nullptr), E_POINTER);
    CComVariant text(L"text");
    EXPECT_EQ(block.SetValue(text), S_OK);
    text.bstrVal[0] = L'n';
    EXPECT_EQ(ValueOf(block), "'text'");
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
}
