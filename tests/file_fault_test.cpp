#include "tests/support.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <string_view>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

using namespace test;

namespace {

/// What happens to one call of the system.
struct Fault
{
    const char* call = "";
    /// Which of the calls it meets; 0 for every one.
    int number = 0;
    /// The error that the call comes back with; 0 for none.
    int error = 0;
    /// How many bytes it transfers at most.
    std::size_t most = 0;
};

Fault fault;
int calls = 0;
/// The file that another program cuts short before it is read; empty for none.
std::filesystem::path shrinking;

bool Meets(std::string_view call)
{
    return call == fault.call && (++calls == fault.number || fault.number == 0);
}

bool Fails(std::string_view call)
{
    if (!Meets(call))
        return false;
    errno = fault.error;
    return fault.error != 0;
}

/// The count of bytes that may be transferred; negative when the call fails.
ssize_t Room(std::string_view call, std::size_t count)
{
    if (!Meets(call))
        return static_cast<ssize_t>(count);
    errno = fault.error;
    return fault.error != 0 ? -1 : static_cast<ssize_t>(std::min(count, fault.most));
}

} // namespace

extern "C" {

int __real_open(const char* path, int flags, mode_t mode);
int __real_fstat(int file, struct stat* status);
int __real_flock(int file, int operation);
int __real_ftruncate(int file, off_t length);
ssize_t __real_read(int file, void* buffer, std::size_t count);
ssize_t __real_write(int file, const void* buffer, std::size_t count);
int __real_close(int file);

int __wrap_open(const char* path, int flags, mode_t mode)
{
    return Fails("open") ? -1 : __real_open(path, flags, mode);
}

int __wrap_fstat(int file, struct stat* status)
{
    return Fails("fstat") ? -1 : __real_fstat(file, status);
}

int __wrap_flock(int file, int operation)
{
    return Fails("flock") ? -1 : __real_flock(file, operation);
}

int __wrap_ftruncate(int file, off_t length)
{
    return Fails("ftruncate") ? -1 : __real_ftruncate(file, length);
}

ssize_t __wrap_read(int file, void* buffer, std::size_t count)
{
    if (!shrinking.empty())
        std::filesystem::resize_file(shrinking, 100);
    const ssize_t room = Room("read", count);
    return room < 0 ? room : __real_read(file, buffer, static_cast<std::size_t>(room));
}

ssize_t __wrap_write(int file, const void* buffer, std::size_t count)
{
    const ssize_t room = Room("write", count);
    return room <= 0 ? room : __real_write(file, buffer, static_cast<std::size_t>(room));
}

int __wrap_close(int file)
{
    // The file is closed all the same.
    const int result = __real_close(file);
    return Fails("close") ? -1 : result;
}
}

namespace {

/// A document of all kinds, and its file.
class FileFault : public testing::Test
{
protected:
    FileFault()
    {
        WriteBytes(m_path, m_bytes);
        EXPECT_EQ(m_document.Import(m_path), S_OK);
    }

    /// Runs `operation` under the fault and returns whether the fault came to pass. No file stays
    /// open or locked.
    template <class Operation>
    bool Under(const Fault& wanted, Operation operation)
    {
        const auto before = OpenFiles();
        fault = wanted;
        calls = 0;
        operation();
        const bool met = calls >= fault.number && calls > 0;
        fault = {};
        EXPECT_EQ(OpenFiles(), before);
        return met;
    }

    static long OpenFiles()
    {
        const std::filesystem::directory_iterator files("/proc/self/fd");
        return std::distance(files, {});
    }

    const std::string m_bytes = ReadBytes(CString(DCM_ALL_KINDS));
    const Folder m_folder;
    const CString m_path = m_folder / L"a.dcm";
    DCMConverter m_document;
};

constexpr HRESULT kFailed = E_UNEXPECTED;

} // namespace

TEST_F(FileFault, OfEachCallOfAnExportIsReported)
{
    const struct
    {
        Fault fault;
        HRESULT result;
    } cases[] = {
        {{"open", 1, EMFILE}, kFailed},     {{"open", 1, EROFS}, kFailed},
        {{"fstat", 1, EIO}, kFailed},       {{"flock", 1, EINTR}, S_OK},
        {{"flock", 1, ENOLCK}, S_OK},       {{"flock", 1, EWOULDBLOCK}, kFailed},
        {{"ftruncate", 1, EIO}, kFailed},   {{"close", 1, EIO}, kFailed},
        {{"close", 1, EINTR}, S_OK},        {{"write", 0, 0, 1}, S_OK},
        {{"write", 0, ENOSPC, 0}, kFailed}, {{"write", 0, 0, 0}, kFailed},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(std::string(c.fault.call) + " " + std::to_string(c.fault.error));
        EXPECT_TRUE(Under(c.fault, [&] { EXPECT_EQ(m_document.Export(m_path), c.result); }));
        if (c.result == S_OK) {
            EXPECT_EQ(ReadBytes(m_path), m_bytes);
        }
        EXPECT_EQ(m_document.Export(m_path), S_OK);
        EXPECT_EQ(ReadBytes(m_path), m_bytes);
    }
    // An export asks for the status itself, and without an answer writes nothing.
    Under({"fstat", 3, EIO, 0}, [&] { EXPECT_EQ(m_document.Export(m_path), S_OK); });
    EXPECT_EQ(ReadBytes(m_path), "");
}

TEST_F(FileFault, OfAnyWriteKeepsWhatWasWrittenBefore)
{
    const struct
    {
        int error;
        std::size_t most;
        HRESULT result;
    } cases[] = {{EIO, 0, kFailed}, {EINTR, 0, S_OK}, {0, 7, S_OK}, {0, 0, kFailed}};
    for (const auto& c : cases) {
        int number = 0;
        HRESULT result = S_OK;
        while (Under({"write", ++number, c.error, c.most},
                     [&] { result = m_document.Export(m_path); })) {
            SCOPED_TRACE(std::to_string(c.error) + " at " + std::to_string(number));
            const std::string written = ReadBytes(m_path);
            EXPECT_EQ(result, c.result);
            EXPECT_EQ(written == m_bytes, result == S_OK);
            EXPECT_TRUE(m_bytes.starts_with(written));
        }
        EXPECT_GT(number, 10);
    }
}

TEST_F(FileFault, OfEachCallOfAnImportIsReported)
{
    const std::string none = ExportBytes(DCMConverter());
    const struct
    {
        Fault fault;
        HRESULT result;
        const std::string& document;
    } cases[] = {
        {{"open", 1, EACCES}, kFailed, none}, {{"fstat", 1, EIO}, kFailed, none},
        {{"fstat", 2, EIO}, S_OK, none},      {{"fstat", 3, EIO}, kFailed, none},
        {{"flock", 1, EINTR}, S_OK, m_bytes}, {{"flock", 1, EWOULDBLOCK}, kFailed, none},
        {{"read", 1, EIO}, kFailed, none},    {{"read", 1, EINTR}, S_OK, m_bytes},
        {{"read", 0, 0, 3}, S_OK, m_bytes},   {{"read", 1, 0, 0}, S_OK, none},
        {{"close", 1, EIO}, S_OK, m_bytes},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(std::string(c.fault.call) + " " + std::to_string(c.fault.error));
        DCMConverter document;
        EXPECT_TRUE(Under(c.fault, [&] { EXPECT_EQ(document.Import(m_path), c.result); }));
        EXPECT_EQ(ExportBytes(document), c.document);
    }
}

TEST_F(FileFault, OfAFileThatShrinksLeavesItsFirstBlocks)
{
    DCMConverter document;
    shrinking = PathOf(m_path);
    EXPECT_EQ(document.Import(m_path), S_OK);
    shrinking.clear();
    EXPECT_EQ(document.GetFestwerte().size(), 0U);
    EXPECT_EQ(std::filesystem::file_size(PathOf(m_path)), 100U);
}

TEST(HostileFile, IsReadOrRefused)
{
    const Folder folder;
    const CString path = folder / L"hostile.dcm";
    const auto name = PathOf(path);
    const struct
    {
        const char* what;
        void (*make)(const std::filesystem::path&);
        HRESULT result;
        std::size_t blocks;
    } cases[] = {
        {"zeros", [](const auto& p) { std::ofstream(p) << std::string(1 << 20, '\0'); }, S_OK, 0},
        {"0xFF", [](const auto& p) { std::ofstream(p) << std::string(1 << 20, '\xFF'); }, S_OK, 0},
        {"one line of 100 MB, no line end",
         [](const auto& p) {
             std::ofstream file(p);
             for (int i = 0; i < 100; ++i)
                 file << std::string(1 << 20, 'x');
         },
         S_OK, 0},
        {"one line of 100 MB",
         [](const auto& p) {
             std::ofstream file(p);
             file << "FESTWERT ";
             for (int i = 0; i < 100; ++i)
                 file << std::string(1 << 20, 'x');
             file << "\n\n";
         },
         S_OK, 1},
        {"2 GiB",
         [](const auto& p) {
             std::ofstream{p};
             std::filesystem::resize_file(p, 1ULL << 31);
         },
         kFailed, 0},
        {"16 GiB",
         [](const auto& p) {
             std::ofstream{p};
             std::filesystem::resize_file(p, 1ULL << 34);
         },
         kFailed, 0},
        {"folder", [](const auto& p) { std::filesystem::create_directory(p); }, kFailed, 0},
        {"pipe", [](const auto& p) { mkfifo(p.c_str(), 0600); }, kFailed, 0},
        {"link to itself", [](const auto& p) { std::filesystem::create_symlink(p, p); }, kFailed,
         0},
        {"not readable",
         [](const auto& p) {
             std::ofstream(p) << "FESTWERT a\n\n";
             std::filesystem::permissions(p, std::filesystem::perms::none);
         },
         kFailed, 0},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.what);
        c.make(name);
        // Permissions hold for everybody but root.
        const uid_t user = geteuid();
        ASSERT_EQ(user == 0 ? seteuid(65534) : 0, 0);
        DCMConverter document;
        const HRESULT result = document.Import(path);
        ASSERT_EQ(seteuid(user), 0);
        EXPECT_EQ(result, c.result);
        EXPECT_EQ(document.GetFestwerte().size(), c.blocks);
        std::filesystem::remove(name);
    }
}
