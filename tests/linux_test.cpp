#include "dcm/platform/cfile.h"
#include "tests/support.h"

#include <gtest/gtest.h>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

using namespace test;

namespace {

CFileException::Cause CauseOfOpening(const CString& path, UINT flags)
{
    CFileException error;
    return CFile().Open(path, flags, &error) ? CFileException::none : error.m_cause;
}

constexpr UINT kCreate = CFile::modeCreate | CFile::modeWrite;

} // namespace

TEST(LinuxFile, RefusesPipesAndFilesOfTwoGibibytes)
{
    const Folder folder;
    const CString pipe = folder / L"pipe";
    ASSERT_EQ(mkfifo(PathOf(pipe).c_str(), 0600), 0);
    const int reader = open(PathOf(pipe).c_str(), O_RDONLY | O_NONBLOCK);
    EXPECT_EQ(CauseOfOpening(pipe, CFile::modeRead), CFileException::accessDenied);
    EXPECT_EQ(CauseOfOpening(pipe, kCreate), CFileException::accessDenied);
    close(reader);
    const CString large = folder / L"large";
    WriteBytes(large, "");
    std::filesystem::resize_file(PathOf(large), (1ULL << 31) - 1);
    EXPECT_EQ(CauseOfOpening(large, CFile::modeRead), CFileException::none);
    std::filesystem::resize_file(PathOf(large), 1ULL << 31);
    EXPECT_EQ(CauseOfOpening(large, CFile::modeRead), CFileException::fileTooLarge);
    EXPECT_EQ(CauseOfOpening(large, kCreate), CFileException::fileTooLarge);
    EXPECT_EQ(std::filesystem::file_size(PathOf(large)), 1ULL << 31);
}

TEST(LinuxFile, IsRefusedWhileAnotherProgramHasLockedIt)
{
    const Folder folder;
    const CString path = folder / L"held.dcm";
    DCMConverter document;
    ASSERT_EQ(document.Export(path), S_OK);
    const std::string before = ReadBytes(path);
    const int other = open(PathOf(path).c_str(), O_RDONLY);
    ASSERT_EQ(flock(other, LOCK_SH), 0);
    document.SetHeader(L"new");
    EXPECT_EQ(document.Import(path), E_UNEXPECTED);
    EXPECT_EQ(document.Export(path), E_UNEXPECTED);
    EXPECT_EQ(ReadBytes(path), before);
    close(other);
    EXPECT_EQ(document.Export(path), S_OK);
}

TEST(LinuxFile, ReportsAFullDevice)
{
    DCMConverter document;
    EXPECT_EQ(document.Export(L"/dev/full"), E_UNEXPECTED);
    EXPECT_EQ(document.Export(L"/dev/null"), S_OK);
    EXPECT_EQ(document.Import(L"/dev/null"), S_OK);
    PravFile file(L"/dev/full", kCreate);
    try {
        file.WriteText(L"text");
        ADD_FAILURE() << "written";
    } catch (const CFileException& error) {
        EXPECT_EQ(error.m_cause, CFileException::diskFull);
    }
}
