#include "tests/support.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <string_view>
#include <tuple>

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

/// The count of bytes that may be transferred; negative when the call fails.
ssize_t Room(std::string_view call, std::size_t count)
{
    if (call != fault.call || (++calls != fault.number && fault.number != 0))
        return static_cast<ssize_t>(count);
    errno = fault.error;
    return fault.error != 0 ? -1 : static_cast<ssize_t>(std::min(count, fault.most));
}

} // namespace

extern "C" {

// A call that can fail but transfers nothing.
#define DCM_TEST_WRAP(call, parameters, arguments)                                                 \
    int __real_##call parameters;                                                                  \
    int __wrap_##call parameters                                                                   \
    {                                                                                              \
        return Room(#call, 0) < 0 ? -1 : __real_##call arguments;                                  \
    }

DCM_TEST_WRAP(open, (const char* path, int flags, mode_t mode), (path, flags, mode))
DCM_TEST_WRAP(fstat, (int file, struct stat* status), (file, status))
DCM_TEST_WRAP(flock, (int file, int operation), (file, operation))
DCM_TEST_WRAP(ftruncate, (int file, off_t length), (file, length))

int __real_close(int file);
ssize_t __real_read(int file, void* buffer, std::size_t count);
ssize_t __real_write(int file, const void* buffer, std::size_t count);

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
    return Room("close", 0) < 0 ? -1 : result;
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
        return std::distance(std::filesystem::directory_iterator("/proc/self/fd"), {});
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
    const std::pair<Fault, HRESULT> cases[] = {
        {{"open", 1, EMFILE}, kFailed},   {{"open", 1, EROFS}, kFailed},
        {{"fstat", 1, EIO}, kFailed},     {{"flock", 1, EINTR}, S_OK},
        {{"flock", 1, ENOLCK}, S_OK},     {{"flock", 1, EWOULDBLOCK}, kFailed},
        {{"ftruncate", 1, EIO}, kFailed}, {{"close", 1, EIO}, kFailed},
        {{"close", 1, EINTR}, S_OK},      {{"write", 0, 0, 1}, S_OK},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(std::string(c.first.call) + " " + std::to_string(c.first.error));
        EXPECT_TRUE(Under(c.first, [&] { EXPECT_EQ(m_document.Export(m_path), c.second); }));
        EXPECT_TRUE(c.second != S_OK || ReadBytes(m_path) == m_bytes);
        EXPECT_EQ(ExportBytes(m_document, m_path), m_bytes);
    }
    // An export asks for the status itself, and without an answer writes nothing.
    Under({"fstat", 3, EIO}, [&] { EXPECT_EQ(ExportBytes(m_document, m_path), ""); });
}

TEST_F(FileFault, OfAnyWriteKeepsWhatWasWrittenBefore)
{
    const std::pair<Fault, HRESULT> cases[] = {{{"write", 0, EIO}, kFailed},
                                               {{"write", 0, EINTR}, S_OK},
                                               {{"write", 0, 0, 7}, S_OK},
                                               {{"write", 0, 0, 0}, kFailed}};
    for (auto [one, expected] : cases) {
        HRESULT result = S_OK;
        while (++one.number, Under(one, [&] { result = m_document.Export(m_path); })) {
            SCOPED_TRACE(std::to_string(one.error) + " at " + std::to_string(one.number));
            const std::string written = ReadBytes(m_path);
            EXPECT_EQ(result, expected);
            EXPECT_EQ(written == m_bytes, result == S_OK);
            EXPECT_TRUE(m_bytes.starts_with(written));
        }
        EXPECT_GT(one.number, 10);
    }
}

TEST_F(FileFault, HasACause)
{
    using Cause = CFileException::Cause;
    const std::pair<int, Cause> cases[] = {
        {ENOTDIR, Cause::badPath},    {EMFILE, Cause::tooManyOpenFiles},
        {EPERM, Cause::accessDenied}, {EBADF, Cause::invalidFile},
        {EIO, Cause::hardIO},         {EDQUOT, Cause::diskFull},
        {EFBIG, Cause::fileTooLarge}, {ENOMEM, Cause::generic},
    };
    for (const auto& c : cases)
        Under({"open", 1, c.first}, [&] { EXPECT_EQ(CauseOf(m_path, kRead), c.second); });
}

TEST_F(FileFault, OfEachCallOfAnImportIsReported)
{
    const std::string none = ExportBytes(DCMConverter());
    const std::tuple<Fault, HRESULT, std::string> cases[] = {
        {{"open", 1, EACCES}, kFailed, none}, {{"fstat", 1, EIO}, kFailed, none},
        {{"fstat", 2, EIO}, S_OK, none},      {{"fstat", 3, EIO}, kFailed, none},
        {{"flock", 1, EINTR}, S_OK, m_bytes}, {{"flock", 1, EWOULDBLOCK}, kFailed, none},
        {{"read", 1, EIO}, kFailed, none},    {{"read", 1, EINTR}, S_OK, m_bytes},
        {{"read", 0, 0, 3}, S_OK, m_bytes},   {{"read", 1, 0, 0}, S_OK, none},
        {{"close", 1, EIO}, S_OK, m_bytes},
    };
    for (const auto& [one, result, content] : cases) {
        SCOPED_TRACE(std::string(one.call) + " " + std::to_string(one.error));
        DCMConverter document;
        HRESULT imported = S_OK;
        EXPECT_TRUE(Under(one, [&] { imported = document.Import(m_path); }));
        EXPECT_EQ(imported, result);
        EXPECT_EQ(ExportBytes(document), content);
    }
    // A file that another program cuts short before it is read.
    DCMConverter document;
    shrinking = PathOf(m_path);
    EXPECT_EQ(document.Import(m_path), S_OK);
    shrinking.clear();
    EXPECT_EQ(document.GetFestwerte().size(), 0U);
}

TEST(HostileFile, IsReadOrRefused)
{
    const Folder folder;
    const CString path = folder / L"hostile.dcm";
    const std::string line(100 << 20, 'x');
    for (const std::string& bytes : {std::string(1 << 20, '\0'), std::string(1 << 20, '\xFF'), line,
                                     "FESTWERT " + line + "\n\n"}) {
        DCMConverter document;
        EXPECT_EQ(ImportBytes(document, bytes, path), S_OK);
        EXPECT_EQ(document.GetFestwerte().size(), bytes[0] == 'F' ? 1U : 0U);
    }
    // Its low 32 bits are those of an empty file.
    std::filesystem::resize_file(PathOf(path), 1ULL << 34);
    EXPECT_EQ(DCMConverter().Import(path), kFailed);
}
