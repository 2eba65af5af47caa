#include "tests/support.h"

#include <gtest/gtest.h>

#include <tuple>

using namespace test;

namespace {

/// The comment, then the names of the FESTWERT blocks.
std::string Content(const DCMConverter& document)
{
    std::string names;
    for (const DCMFestwert& block : document.GetFestwerte())
        names += dcm::ToUtf8(block.GetName());
    return dcm::ToUtf8(document.GetComment()) + "|" + names;
}

} // namespace

TEST(Document, FindsBlocksAndTheComment)
{
    const std::tuple<std::string, std::string, HRESULT> cases[] = {
        {"FESTWERT a\nEND\n", "|", S_OK},
        {"\n\nFESTWERT a\n\nFestwert b\r\nEND\r\r\n\r\r\nFESTWERTE c\n\n", "|ab", S_OK},
        {"FESTWERT a\n \nfestwert b\n\n", "|b", S_OK},
        {"FESTWERT\ta\n\n FESTWERT b\n\nFESTWERT\n FESTWERT c\n\nEND\n\n", "|", S_OK},
        {"* a\r\n*\r\nb\r\n\r\n", "a\n*\nb\n|", S_OK},
        {"* a * b **  c\n\n*d e\n\n", "a b * c\n|", S_OK},
        {"* a\n\nX y\n\n* b\n\nFESTWERT c\n\n* d\n\n", "b\n|c", S_OK},
        {"* a\nFESTWERT b\n\n", "a\nFESTWERT b\n|", S_OK},
        {"Konservierung_Format 1.0\n\n* a\n\n", "|", S_OK},
        {"STUETZSTELLENVERTEILUNG s 1\nTEXT \"a\"\n\n* a\n\nFESTWERT b\n\n", "|b", S_OK},
        {"FESTWERT a\n\nFESTWERTEBLOCK b 1\nWERT \n\nFESTWERT c\n\n", "|a", E_UNEXPECTED}};
    for (const auto& [bytes, content, result] : cases) {
        SCOPED_TRACE(bytes);
        DCMConverter document;
        EXPECT_EQ(ImportBytes(document, bytes), result);
        EXPECT_EQ(Content(document), content);
    }
}

TEST(Document, AddsWhatItImports)
{
    DCMConverter document;
    EXPECT_EQ(ImportBytes(document, "* one\n\nFESTWERT a\n\n"), S_OK);
    EXPECT_EQ(ImportBytes(document, "FESTWERT b\n\n"), S_OK);
    EXPECT_EQ(Content(document), "one\n|ab");
    EXPECT_EQ(ImportBytes(document, "* two\n\nFESTWERT b\n\n"), S_OK);
    EXPECT_EQ(document.Import(L"no such folder/a.dcm"), E_UNEXPECTED);
    EXPECT_EQ(Content(document), "two\n|abb");
}

TEST(Document, FindsNothingInALineWithoutAnEnd)
{
    for (const char fill : {'\0', '\xFF', 'x', ' ', '\r'}) {
        DCMConverter document;
        EXPECT_EQ(ImportBytes(document, std::string(100'000'000, fill)), S_OK);
        EXPECT_EQ(Content(document), "|");
    }
}

TEST(Document, WritesHeaderFormatAndBlocks)
{
    DCMConverter document;
    EXPECT_EQ(ExportBytes(document), "\r\n\r\nKONSERVIERUNG_FORMAT 2.0\r\n\r\n");
    document.SetVersion(1.0);
    EXPECT_EQ(ImportBytes(document, "* not written\n\n"), S_OK);
    document.SetHeader(L"* a\n* b");
    DCMFestwert block;
    block.SetUnit(L" ");
    EXPECT_EQ(document.AddFestwert(block), S_OK);
    const std::string text =
        "* a\r\n* b\r\n\r\nKONSERVIERUNG_FORMAT 2.0\r\n\r\n"
        "FESTWERT \r\n    LANGNAME \"\"\r\n    EINHEIT_W \"\"\r\n    WERT 0.0\r\nEND\r\n\r\n";
    for (int pass = 0; pass < 2; ++pass)
        EXPECT_EQ(ExportBytes(document), text) << "the stored blocks keep their unit";
}

TEST(Document, GoesThereAndBackInTheThreadsCodePage)
{
    // Characters of several bytes, some like those of ASCII, and an ASCII of other bytes.
    const std::pair<unsigned, std::string_view> cases[] = {
        {65001, "* \xE6\x97\xA5\xF0\x9F\x98\x80\r\n\r\n"},
        {932, "* \x93\xFA\x96{\x83\\\r\n\r\n"},
        {500, "\x5C\x40\xC7\x99\xCC\x59\x85\x0D\x25\x0D\x25"}};
    for (const auto& [page, bytes] : cases) {
        DCMConverter document;
        if (!ChoosePage(page))
            continue;
        EXPECT_EQ(ImportBytes(document, bytes), S_OK);
        document.SetHeader(L"* " + document.GetComment());
        EXPECT_TRUE(ExportBytes(document).starts_with(bytes));
    }
    dcm::SetThreadCodePage(1252);
}

TEST(FormatVersion, ReadsItsNumber)
{
    const std::pair<const wchar_t*, double> cases[] = {
        {L"KONSERVIERUNG_FORMAT 2.0\n", 2.0},
        {L"konservierung_format  \"1.5\"", 1.5},
        {L"KONSERVIERUNG_FORMAT \n-1", -1.0},
        {L"KONSERVIERUNG_FORMAT x", 0.0},
        {L"FESTWERT 2.0", 7.0},

        {L" KONSERVIERUNG_FORMAT 2.0", 7.0},
        {L"KONSERVIERUNG_FORMAT\n 2.0\n", 7.0},
    };
    for (const auto& [text, value] : cases) {
        DCMKonservierungsFormat format;
        format.SetValue(7.0);
        EXPECT_EQ(format.Init(text), S_OK);
        EXPECT_EQ(format.GetValue(), value) << testing::PrintToString(CString(text));
    }
}
