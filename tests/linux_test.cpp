#include "tests/support.h"

#include <gtest/gtest.h>

#include <string_view>
#include <tuple>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

using namespace test;

namespace {

CFileException::Cause CauseOf(const CString& path, UINT flags)
{
    CFileException error;
    return CFile().Open(path, flags, &error) ? CFileException::none : error.m_cause;
}

} // namespace

TEST(LinuxFile, RefusesPipesAndWhatItMayNotOpen)
{
    const Folder folder;
    const CString pipe = folder / L"pipe", loop = folder / L"loop", closed = folder / L"closed";
    ASSERT_EQ(mkfifo(PathOf(pipe).c_str(), 0600), 0);
    std::filesystem::create_symlink(PathOf(loop), PathOf(loop));
    WriteBytes(closed, "FESTWERT a\n\n");
    std::filesystem::permissions(PathOf(closed), std::filesystem::perms::none);
    const int reader = open(PathOf(pipe).c_str(), O_RDONLY | O_NONBLOCK);
    EXPECT_EQ(CauseOf(pipe, kRead), CFileException::accessDenied);
    EXPECT_EQ(CauseOf(pipe, kCreate), CFileException::accessDenied);
    // Permissions hold for everybody but root.
    const uid_t user = geteuid();
    ASSERT_EQ(user == 0 ? seteuid(65534) : 0, 0);
    EXPECT_EQ(CauseOf(loop, kRead), CFileException::badPath);
    EXPECT_EQ(CauseOf(closed, kRead), CFileException::accessDenied);
    EXPECT_EQ(CauseOf(closed, kCreate), CFileException::accessDenied);
    ASSERT_EQ(seteuid(user), 0);
    close(reader);
}

TEST(LinuxFile, IsRefusedWhileAnotherProgramHasLockedIt)
{
    const Folder folder;
    const CString path = folder / L"held.dcm";
    WriteBytes(path, "kept");
    const int other = open(PathOf(path).c_str(), O_RDONLY);
    ASSERT_EQ(flock(other, LOCK_SH), 0);
    DCMConverter document;
    EXPECT_EQ(document.Import(path), E_UNEXPECTED);
    EXPECT_EQ(document.Export(path), E_UNEXPECTED);
    EXPECT_EQ(ReadBytes(path), "kept");
    close(other);
    EXPECT_EQ(document.Export(path), S_OK);
}

TEST(LinuxFile, ReportsAFullDevice)
{
    EXPECT_EQ(DCMConverter().Export(L"/dev/full"), E_UNEXPECTED);
    EXPECT_EQ(DCMConverter().Export(L"/dev/null"), S_OK);
    EXPECT_EQ(DCMConverter().Import(L"/dev/null"), S_OK);
    EXPECT_THROW(PravFile(L"/dev/full", kCreate).WriteText(L"text"), CFileException);
}

TEST(LinuxCodePages, HaveTheNamesOfTheCLibrary)
{
    const std::tuple<unsigned, std::string_view, std::wstring_view> cases[] = {
        {20127, "a?", L"a?"},
        {20866, "\xC1\xBF", L"\u0430\u00A9"},
        {21866, "\xC1\xA4", L"\u0430\u0454"},
        {28605, "\xA4", L"\u20AC"},
        {54936, "\xC4\xE3\x81\x30\x81\x30", L"\u4F60\u0080"}};
    for (const auto& [identifier, bytes, text] : cases) {
        ASSERT_TRUE(dcm::SetThreadCodePage(identifier));
        EXPECT_EQ(dcm::Widen(bytes), text) << identifier;
        EXPECT_EQ(Narrow(text), bytes) << identifier;
    }
    for (const unsigned unknown : {0U, 28590U, 28607U, 4711U})
        EXPECT_FALSE(dcm::SetThreadCodePage(unknown)) << unknown;
    dcm::SetThreadCodePage(1252);
}
