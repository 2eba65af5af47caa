#include "tests/support.h"

#include <gtest/gtest.h>

using namespace test;

namespace {

constexpr UINT kCreate = CFile::modeCreate | CFile::modeWrite;

std::string Lines(PravFile& file)
{
    std::string lines;
    CString line(L"old");
    while (file.ReadLine(line) == 1)
        lines += "[" + dcm::ToUtf8(line) + "]";
    EXPECT_EQ(line, L"");
    EXPECT_EQ(file.ReadLine(line), 0);
    return lines;
}

} // namespace

TEST(TextFile, HandsOutLines)
{
    const Folder folder;
    const struct
    {
        std::string_view bytes;
        std::string_view lines;
    } cases[] = {
        {"", ""},
        {"no line feed", ""},
        {"\n", "[]"},
        {"a\nb", "[a]"},
        {"a\nb\n", "[a][b]"},
        {"a\r\nb\r\n", "[a][b]"},
        {"a\n\nb\n", "[a][][b]"},
        {"a\r\r\n\r\r\n", "[a][]"},
        {"a\rb\n\rc\n", "[a\rb][\rc]"},
        {" \n\t\n", "[ ][\t]"},
        {{"a\nb\0c\nd\n", 8}, "[a]"},
        {{"\0a\n", 3}, ""},
        {"\xE4\xB5\n", "[\xC3\xA4\xC2\xB5]"},
        {"\xEF\xBB\xBF\n", "[\xC3\xAF\xC2\xBB\xC2\xBF]"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(testing::PrintToString(c.bytes));
        WriteBytes(folder / L"in", c.bytes);
        for (const UINT flags : {UINT{CFile::modeRead}, UINT{CFile::modeReadWrite}}) {
            PravFile file(folder / L"in", flags);
            EXPECT_EQ(Lines(file), c.lines);
        }
        PravFile writer(folder / L"in", CFile::modeWrite);
        EXPECT_EQ(Lines(writer), "");
    }
}

TEST(TextFile, WritesTextWithCrLf)
{
    const Folder folder;
    const struct
    {
        std::wstring_view text;
        std::string_view bytes;
    } cases[] = {
        {L"", ""},
        {L"a\nb\r\n", "a\r\nb\r\n"},
        {L"a\rb", "a\rb"},
        {L"a\r", "a\r"},
        {L"\r\r\n\n\r", "\r\r\n\r\n\r"},
        {L"20\u00B0 \u03A9", "20\xB0 ?"},
        {{L"a\0b", 3}, {"a\0b", 3}},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(testing::PrintToString(c.bytes));
        PravFile file(folder / L"out", kCreate);
        EXPECT_EQ(file.WriteText(CString(c.text)), 1);
        EXPECT_EQ(file.WriteText(L"|"), 1);
        file.Close();
        EXPECT_EQ(ReadBytes(folder / L"out"), std::string(c.bytes) + "|");
    }
}

TEST(TextFile, OpensAnewWithOrWithoutSuccess)
{
    const Folder folder;
    WriteBytes(folder / L"a", "a1\na2\n");
    WriteBytes(folder / L"b", "b1\n");
    PravFile file;
    EXPECT_EQ(Lines(file), "");
    CString line;
    EXPECT_TRUE(file.Open(folder / L"a", CFile::modeRead, nullptr));
    EXPECT_EQ(file.ReadLine(line), 1);
    EXPECT_TRUE(file.Open(folder / L"b", CFile::modeRead));
    EXPECT_EQ(Lines(file), "[b1]");
    EXPECT_TRUE(file.Open(folder / L"a", CFile::modeRead));
    CFileException error;
    CFile& base = file;
    EXPECT_FALSE(base.Open(folder / L"missing", CFile::modeRead, &error));
    EXPECT_EQ(error.m_cause, CFileException::fileNotFound);
    EXPECT_EQ(Lines(file), "");
    EXPECT_THROW(file.WriteText(L"a"), CFileException);
    EXPECT_THROW(PravFile(folder / L"missing", CFile::modeRead), CFileException);
}

TEST(TextFile, ConvertsLongTextWhole)
{
    const Folder folder;
    const std::wstring text(1'000'000, L'\u20AC');
    std::string bytes;
    for (std::size_t i = 0; i < text.size(); ++i)
        bytes += "\xE2\x82\xAC";
    dcm::SetThreadCodePage(65001);
    PravFile file(folder / L"euros", kCreate);
    file.WriteText(CString(text) + L"\n");
    file.Close();
    EXPECT_TRUE(ReadBytes(folder / L"euros") == bytes + "\r\n");
    EXPECT_TRUE(file.Open(folder / L"euros", CFile::modeRead));
    dcm::SetThreadCodePage(1252);
    CString line;
    EXPECT_EQ(file.ReadLine(line), 1);
    EXPECT_TRUE(line == text) << "the page that counts is the one at the time of opening";
}
