#include "tests/support.h"

#include <gtest/gtest.h>

using namespace test;

namespace {

using namespace std::literals;

std::string Lines(PravFile& file)
{
    std::string lines;
    CString line(L"old");
    while (file.ReadLine(line) == 1)
        lines += "[" + dcm::ToUtf8(line) + "]";
    EXPECT_EQ(line, L"");
    return lines;
}

} // namespace

TEST(TextFile, HandsOutLines)
{
    const std::pair<std::string_view, std::string_view> cases[] = {
        {"no line feed", ""},
        {"a\n\nb\r\nc\r\r\n\r\r\nd\re\n\rf\n \t\ng", "[a][][b][c][][d\re][\rf][ \t]"},
        {"a\nb\0c\nd\n"sv, "[a]"},
        {"\xEF\xBB\xBF\xE4\xB5\n", "[\u00EF\u00BB\u00BF\u00E4\u00B5]"}};
    const Folder folder;
    for (const auto& [bytes, lines] : cases) {
        WriteBytes(folder / L"in", bytes);
        for (const UINT flags : {kRead, UINT{CFile::modeReadWrite}, UINT{CFile::modeWrite}}) {
            PravFile file(folder / L"in", flags);
            EXPECT_EQ(Lines(file), flags == CFile::modeWrite ? "" : lines);
        }
    }
}

TEST(TextFile, WritesTextWithCrLf)
{
    const Folder folder;
    PravFile file(folder / L"out", kCreate);
    for (const auto text : {L""sv, L"a\nb\r\nc\rd\r\r\n\n\r"sv, L"20\u00B0"sv, L"\n"sv, L"e\0f"sv})
        EXPECT_EQ(file.WriteText(CString(text)), 1);
    file.Close();
    EXPECT_EQ(ReadBytes(folder / L"out"), "a\r\nb\r\nc\rd\r\r\n\r\n\r20\xB0\r\ne?f");
}

TEST(TextFile, OpensAnewWithOrWithoutSuccess)
{
    const Folder folder;
    WriteBytes(folder / L"a", "a1\na2\n");
    PravFile file;
    CString line;
    EXPECT_EQ(Lines(file), "");
    for (int pass = 0; pass < 2; ++pass) {
        EXPECT_TRUE(file.Open(folder / L"a", kRead));
        EXPECT_EQ(file.ReadLine(line), 1);
        EXPECT_EQ(line, L"a1");
    }
    // A host's class may load the text again. The file has been read to its end by then.
    struct HostFile : PravFile
    {
        using PravFile::LoadContent, PravFile::PravFile;
    };
    for (const UINT flags : {kRead, kCreate}) {
        file.Close();
        HostFile again(folder / L"a", kRead);
        EXPECT_EQ(again.ReadLine(line), 1);
        again.LoadContent(flags);
        EXPECT_EQ(Lines(again), "");
    }
    EXPECT_FALSE(static_cast<CFile&>(file).Open(folder / L"missing", kRead));
    EXPECT_EQ(Lines(file), "");
    EXPECT_THROW(file.WriteText(L"a"), CFileException);
}

TEST(TextFile, IsClosedAfterAFailureToLoad)
{
    struct GrownFile : PravFile
    {
        BOOL GetStatus(CFileStatus& status) const override
        {
            status.m_size = 1ULL << 31;
            return TRUE;
        }
    } file;
    const Folder folder;
    const CString path = folder / L"a";
    WriteBytes(path, "a\n");
    try {
        file.Open(path, kRead);
        ADD_FAILURE() << "a file of 2 GiB";
    } catch (const CFileException& error) {
        EXPECT_EQ(error.m_cause, CFileException::fileTooLarge);
        EXPECT_EQ(error.m_strFileName, path);
    }
    EXPECT_EQ(CauseOf(path, kRead), CFileException::none) << "it is not locked any more";
}

TEST(TextFile, ConvertsLongTextWhole)
{
    const Folder folder;
    const CString text(std::wstring(1'000'000, L'\u20AC'));
    dcm::SetThreadCodePage(65001);
    PravFile(folder / L"euros", kCreate).WriteText(text + L"\n");
    PravFile file(folder / L"euros", kRead);
    dcm::SetThreadCodePage(1252);
    CString line;
    EXPECT_EQ(file.ReadLine(line), 1);
    EXPECT_TRUE(line == text) << "the code page is the one at the time of opening";
}
