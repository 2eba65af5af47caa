#include "dcm/platform/automation.h"

// Other headers of the system find no choice of the library's.
#if defined(WIN32_LEAN_AND_MEAN) || defined(NOMINMAX)
#error "The library's header leaves macros defined."
#endif

#include "tests/support.h"

#include <gtest/gtest.h>

#include <thread>

using namespace test;

TEST(WindowsFile, RefusesPipes)
{
    const CString path(L"\\\\.\\pipe\\dcm_test");
    for (const UINT flags : {kRead, kCreate}) {
        const HANDLE pipe = CreateNamedPipeW(path, PIPE_ACCESS_DUPLEX, 0, 1, 16, 16, 0, nullptr);
        EXPECT_EQ(CauseOf(path, flags), CFileException::accessDenied);
        EXPECT_TRUE(CloseHandle(pipe));
    }
}

TEST(WindowsFile, IsRefusedWhileAnotherProgramHasItOpen)
{
    const Folder folder;
    const CString path = folder / L"held.dcm";
    WriteBytes(path, "kept");
    constexpr DWORD kShareWithAll = FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE;
    const HANDLE other =
        CreateFileW(path, GENERIC_READ, kShareWithAll, nullptr, OPEN_EXISTING, 0, nullptr);
    for (const UINT flags : {kRead, kCreate})
        EXPECT_EQ(CauseOf(path, flags), CFileException::sharingViolation);
    EXPECT_EQ(ReadBytes(path), "kept");
    EXPECT_TRUE(CloseHandle(other));
    EXPECT_EQ(DCMConverter().Export(path), S_OK);
}

TEST(WindowsFile, TakesTheEmptyDevice)
{
    EXPECT_EQ(DCMConverter().Export(L"NUL"), S_OK);
    EXPECT_EQ(DCMConverter().Import(L"NUL"), S_OK);
}

TEST(WindowsCodePages, StartWithThatOfTheThread)
{
    std::string bytes;
    // A new thread: this one may have chosen a page.
    std::thread([&] {
        SetThreadLocale(MAKELCID(MAKELANGID(LANG_GREEK, SUBLANG_DEFAULT), SORT_DEFAULT));
        // A letter that only looks like one of the page becomes ?, and a surrogate pair becomes one
        // ?.
        bytes = Narrow(L"\u03A9\u0100\u00E4\U0001F600");
    }).join();
    EXPECT_EQ(bytes, "\xD9???");
}

TEST(WindowsLibrary, IsRegisteredWhileItIsLoaded)
{
    for (int i = 0; i < 2; ++i) {
        const HMODULE library = LoadLibraryA(DCM_LIBRARY);
        const auto last = reinterpret_cast<CDynLinkLibrary* (*)() noexcept>(
            reinterpret_cast<void*>(GetProcAddress(library, "_ZN15CDynLinkLibrary4LastEv")));
        ASSERT_NE(last, nullptr);
        EXPECT_EQ(last()->Module().hModule, library);
        EXPECT_TRUE(FreeLibrary(library));
        EXPECT_EQ(GetModuleHandleW(L"dcm.dll"), nullptr);
    }
}
