#include "tests/support.h"

#include <gtest/gtest.h>

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

TEST(LinuxFile, RefusesPipes)
{
    const Folder folder;
    const CString pipe = folder / L"pipe";
    ASSERT_EQ(mkfifo(PathOf(pipe).c_str(), 0600), 0);
    const int reader = open(PathOf(pipe).c_str(), O_RDONLY | O_NONBLOCK);
    EXPECT_EQ(CauseOf(pipe, kRead), CFileException::accessDenied);
    EXPECT_EQ(CauseOf(pipe, kCreate), CFileException::accessDenied);
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
    DCMConverter document;
    EXPECT_EQ(document.Export(L"/dev/full"), E_UNEXPECTED);
    EXPECT_EQ(document.Export(L"/dev/null"), S_OK);
    EXPECT_EQ(document.Import(L"/dev/null"), S_OK);
    PravFile file(L"/dev/full", kCreate);
    EXPECT_THROW(file.WriteText(L"text"), CFileException);
    EXPECT_EQ(file.WriteText(L""), 1);
}
