#include "tests/support.h"

#include <gtest/gtest.h>

#include <tuple>

using namespace test;

namespace {

/// The names of the FESTWERT blocks, with the comment in front.
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
        {"", "|", S_OK},
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
        EXPECT_TRUE(document.GetStuetzstellenverteilung().empty());
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
    // What a list hands out is the caller's.
    document.GetFestwerte().front().SetName(L"x");
    EXPECT_EQ(Content(document), "two\n|abb");
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
    const std::tuple<unsigned, const wchar_t*, std::string_view> cases[] = {
        {65001, L"\u00B0 \u65E5\U0001F600", "\xC2\xB0 \xE6\x97\xA5\xF0\x9F\x98\x80"},
        {932, L"\u65E5\u672C\u30BD", "\x93\xFA\x96{\x83\\"},
        {500, L"Gr\u00F6\u00DFe", "\xC7\x99\xCC\x59\x85"}};
    for (const auto& [page, name, bytes] : cases) {
        DCMConverter document, again;
        document.SetHeader(CString(L"* ") + name);
        ASSERT_TRUE(dcm::SetThreadCodePage(page));
        const std::string file = ExportBytes(document);
        EXPECT_NE(file.find(bytes), file.npos);
        EXPECT_EQ(ImportBytes(again, file), S_OK);
        dcm::SetThreadCodePage(1252);
        EXPECT_EQ(again.GetComment(), CString(name) + L"\n");
    }
}

TEST(FormatVersion, ReadsItsNumber)
{
    const std::pair<const wchar_t*, double> cases[] = {
        {L"KONSERVIERUNG_FORMAT 2.0\n", 2.0},
        {L"konservierung_format  \"1.5\"", 1.5},
        {L"KONSERVIERUNG_FORMAT \n-1", -1.0},
        {L"KONSERVIERUNG_FORMAT x", 0.0},
        {L"FESTWERT 2.0", 7.0},
        {L"x", 7.0},
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
