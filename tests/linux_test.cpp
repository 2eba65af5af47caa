#include "tests/support.h"

#include <gtest/gtest.h>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

using namespace test;

TEST(LinuxFile, RefusesPipesAndWhatItMayNotOpen)
{
    const Folder folder;
    const CString pipe = folder / L"pipe", loop = folder / L"loop", closed = folder / L"closed";
    ASSERT_EQ(mkfifo(PathOf(pipe).c_str(), 0600), 0);
    std::filesystem::create_symlink(PathOf(loop), PathOf(loop));
    WriteBytes(closed, "FESTWERT a\n\n");
    std::filesystem::permissions(PathOf(closed), std::filesystem::perms::none);
    const int reader = open(PathOf(pipe).c_str(), O_RDONLY | O_NONBLOCK);
    // Permissions hold for everybody but root.
    const uid_t user = geteuid();
    for (const UINT flags : {kRead, kCreate}) {
        EXPECT_EQ(CauseOf(pipe, flags), CFileException::accessDenied);
        ASSERT_EQ(user == 0 ? seteuid(65534) : 0, 0);
        EXPECT_EQ(CauseOf(loop, flags), CFileException::badPath);
        EXPECT_EQ(CauseOf(closed, flags), CFileException::accessDenied);
        ASSERT_EQ(seteuid(user), 0);
    }
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
