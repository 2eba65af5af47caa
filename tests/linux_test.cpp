#include "tests/support.h"

#include <gtest/gtest.h>

#include <array>
#include <cerrno>
#include <functional>
#include <limits>
#include <memory>
#include <string_view>
#include <tuple>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

using namespace test;
using namespace std::string_view_literals;

namespace {

/// A fault in calls of one system function.
struct Fault
{
    const char* call = "";
    /// The number of the call that has the fault; 0 for every call.
    int number = 0;
    /// The error that the call reports; 0 for none.
    int error = 0;
    /// The most bytes that the call transfers.
    std::size_t most = 0;
};

Fault fault;
int calls = 0;

/// How often the system was told how memory will be used.
int advices = 0;
/// Whether a file was opened so that programs that are started have it open too.
bool inherited = false;
/// Whether `write` reports success without writing.
bool writesNothing = false;

/// The same flags.
int Noted(int flags)
{
    inherited = inherited || (flags & O_CLOEXEC) == 0;
    return flags;
}

/// The number of bytes that the call may transfer; negative when it fails.
ssize_t Room(std::string_view call, std::size_t count)
{
    if (call != fault.call || (++calls != fault.number && fault.number != 0))
        return static_cast<ssize_t>(count);
    if (fault.error == 0)
        return static_cast<ssize_t>(std::min(count, fault.most));
    errno = fault.error;
    return -1;
}

} // namespace

extern "C" {

// Replaces a system call by one that may fail or transfer less. `suffix` ends the name by which the
// call is linked.
#define DCM_TEST_WRAP_LINKED(suffix, Result, call, count, parameters, arguments)                   \
    Result __real_##call##suffix parameters;                                                       \
    Result __wrap_##call##suffix parameters                                                        \
    {                                                                                              \
        const ssize_t room = Room(#call, count);                                                   \
        return room < 0 ? -1 : __real_##call##suffix arguments;                                    \
    }
#define DCM_TEST_WRAP_EXPANDED(suffix, ...) DCM_TEST_WRAP_LINKED(suffix, __VA_ARGS__)
#define DCM_TEST_WRAP(...) DCM_TEST_WRAP_LINKED(, __VA_ARGS__)
#define DCM_TEST_WRAP_LARGE(...) DCM_TEST_WRAP_EXPANDED(DCM_TEST_LARGE_FILES, __VA_ARGS__)

DCM_TEST_WRAP_LARGE(int, open, 0, (const char* path, int flags, mode_t mode),
                    (path, Noted(flags), mode))
DCM_TEST_WRAP_LARGE(int, fstat, 0, (int file, struct stat* status), (file, status))
DCM_TEST_WRAP(int, flock, 0, (int file, int operation), (file, operation))
DCM_TEST_WRAP_LARGE(int, ftruncate, 0, (int file, off_t length), (file, length))
DCM_TEST_WRAP(ssize_t, read, count, (int file, void* to, std::size_t count),
              (file, to, static_cast<std::size_t>(room)))

DCM_TEST_WRAP(int, fsync, 0, (int file), (file))
DCM_TEST_WRAP(int, fchmod, 0, (int file, mode_t mode), (file, mode))
DCM_TEST_WRAP(ssize_t, readlink, 0, (const char* path, char* to, std::size_t size),
              (path, to, size))
DCM_TEST_WRAP(int, rename, 0, (const char* from, const char* to), (from, to))

ssize_t __real_write(int file, const void* from, std::size_t count);
ssize_t __wrap_write(int file, const void* from, std::size_t count)
{
    const ssize_t room = Room("write", count);
    return room < 0 || writesNothing ? room
                                     : __real_write(file, from, static_cast<std::size_t>(room));
}

int __real_madvise(void* memory, std::size_t size, int advice);
int __wrap_madvise(void* memory, std::size_t size, int advice)
{
    ++advices;
    return __real_madvise(memory, size, advice);
}

int __real_close(int file);
int __wrap_close(int file)
{
    // The file is closed all the same.
    const int result = __real_close(file);
    return Room("close", 0) < 0 ? -1 : result;
}
}

namespace {

/// Runs `operation` with the fault and returns whether the fault happened. `operation` must leave
/// no more files open than before.
bool Under(const Fault& wanted, const std::function<void()>& operation)
{
    const auto openFiles = [] {
        return std::distance(std::filesystem::directory_iterator("/proc/self/fd"), {});
    };
    const auto before = openFiles();
    fault = wanted;
    calls = 0;
    operation();
    fault = {};
    EXPECT_EQ(openFiles(), before);
    return calls >= wanted.number && calls > 0;
}

constexpr HRESULT kFailed = E_UNEXPECTED;

/// A child process that runs `operation` first and ends in the destructor.
class Child
{
public:
    explicit Child(const std::function<void()>& operation)
    {
        EXPECT_EQ(pipe(m_toChild.data()) + pipe(m_fromChild.data()), 0);
        m_process = fork();
        if (m_process == 0) {
            operation();
            char byte = 0;
            close(m_toChild[1]);
            _exit(write(m_fromChild[1], &byte, 1) == 1 && read(m_toChild[0], &byte, 1) == 0 ? 0
                                                                                            : 1);
        }
        char byte = 1;
        EXPECT_EQ(read(m_fromChild[0], &byte, 1), 1) << "the child has not started";
    }
    Child(const Child&) = delete;
    Child& operator=(const Child&) = delete;
    ~Child()
    {
        close(m_toChild[1]);
        int status = 1;
        EXPECT_EQ(waitpid(m_process, &status, 0), m_process);
        EXPECT_EQ(status, 0);
        for (const int file : {m_toChild[0], m_fromChild[0], m_fromChild[1]})
            close(file);
    }

private:
    std::array<int, 2> m_toChild{}, m_fromChild{};
    pid_t m_process = 0;
};

} // namespace

TEST(FileFault, OfEachCallIsReported)
{
    // The results of an export and of an import, and whether the import reads everything. Most
    // calls are made by both.
    const std::tuple<Fault, HRESULT, HRESULT, bool> cases[] = {
        {{"open", 1, EMFILE}, kFailed, kFailed, false},
        {{"fstat", 1, EIO}, kFailed, kFailed, false},
        {{"fstat", 2, EIO}, S_OK, S_OK, false},
        {{"flock", 1, EINTR}, S_OK, S_OK, true},
        {{"flock", 1, ENOLCK}, S_OK, S_OK, true},
        {{"flock", 1, EWOULDBLOCK}, kFailed, kFailed, false},
        {{"ftruncate", 1, EIO}, kFailed, S_OK, true},
        {{"write", 0, ENOSPC}, kFailed, S_OK, true},
        {{"write", 2, EIO}, kFailed, S_OK, true},
        {{"write", 2, 0, 0}, kFailed, S_OK, true},
        {{"write", 1, EINTR}, S_OK, S_OK, true},
        {{"write", 0, 0, 1}, S_OK, S_OK, true},
        {{"read", 1, EIO}, S_OK, kFailed, false},
        {{"read", 1, EINTR}, S_OK, S_OK, true},
        {{"read", 0, 0, 3}, S_OK, S_OK, true},
        {{"read", 1, 0, 0}, S_OK, S_OK, false},
        {{"close", 1, EIO}, kFailed, S_OK, true},
        {{"close", 1, EINTR}, S_OK, S_OK, true}};
    const std::string none = ExportBytes(DCMConverter()), bytes = ReadBytes(CString(DCM_ALL_KINDS));
    const Folder folder;
    const CString path = folder / L"a.dcm";
    DCMConverter source;
    EXPECT_EQ(ImportBytes(source, bytes, path), S_OK);
    for (const auto& [one, exported, imported, whole] : cases) {
        SCOPED_TRACE(std::string(one.call) + " " + std::to_string(one.error));
        DCMConverter document;
        HRESULT result = S_OK;
        bool met = Under(one, [&] { result = source.Export(path); });
        EXPECT_EQ(result, exported);
        // When the export's own request for the status fails, it writes nothing.
        EXPECT_TRUE(result != S_OK || ReadBytes(path) == (one.call == "fstat"sv ? "" : bytes));
        EXPECT_TRUE(bytes.starts_with(ReadBytes(path))) << "what was written before stays";
        EXPECT_EQ(ExportBytes(source, path), bytes);
        met = Under(one, [&] { result = document.Import(path); }) || met;
        EXPECT_EQ(result, imported);
        EXPECT_EQ(ExportBytes(document), whole ? bytes : none);
        EXPECT_TRUE(met);
    }
    dcm::Report report;
    EXPECT_TRUE(Under({"fstat", 2, EIO}, [&] { dcm::Export(source, path, report); }));
    EXPECT_EQ(report.Count("cannot-write"), 1U);
}

TEST(FileFault, HasACauseANumberAndWords)
{
    using File = CFileException;
    const std::pair<File::Cause, std::vector<int>> cases[] = {
        {File::fileNotFound, {ENOENT}},
        {File::badPath, {ENOTDIR, ENAMETOOLONG, ELOOP}},
        {File::tooManyOpenFiles, {EMFILE, ENFILE}},
        {File::accessDenied, {EACCES, EPERM, EROFS, EISDIR, ETXTBSY}},
        {File::invalidFile, {EBADF}},
        {File::hardIO, {EIO}},
        {File::diskFull, {ENOSPC, EDQUOT, 0}},
        {File::fileTooLarge, {EFBIG, EOVERFLOW}},
        {File::generic, {EINVAL}}};
    const Folder folder;
    const CString path = folder / L"file";
    const auto check = [&](const Fault& one, File::Cause cause, const std::string& words) {
        SCOPED_TRACE(one.call + (" " + words));
        EXPECT_TRUE(Under(one, [&] {
            try {
                CFile file(path, CFile::modeCreate | CFile::modeReadWrite);
                char byte = 0;
                file.GetLength();
                file.Read(&byte, 1);
                errno = EIO; // Left from another call, it says nothing.
                file.Write(&byte, 1);
                file.Close();
                ADD_FAILURE() << "not raised";
            } catch (const CFileException& error) {
                EXPECT_EQ(error.m_cause, cause);
                EXPECT_EQ(error.m_lOsError, one.error);
                EXPECT_EQ(error.m_strFileName, path);
                EXPECT_EQ(error.what(), dcm::ToUtf8(path) + ": " + words);
            }
        }));
    };
    for (const auto& [cause, numbers] : cases) {
        for (const int number : numbers) {
            if (number == 0) {
                check({"write", 1, 0, 0}, cause, "no room for all of the text");
                continue;
            }
            // Opening a file asks for its status too.
            const std::string words = std::system_category().message(number);
            for (const char* call : {"open", "fstat", "read", "write", "close"})
                check({call, call == std::string_view("fstat") ? 2 : 1, number}, cause, words);
        }
    }
}

TEST(FileFault, OfAnyWriteEndsTheExport)
{
    const std::string bytes = ReadBytes(CString(DCM_ALL_KINDS));
    const Folder folder;
    const CString path = folder / L"a.dcm";
    DCMConverter document;
    EXPECT_EQ(ImportBytes(document, bytes, path), S_OK);
    int number = 1;
    for (HRESULT result = kFailed; result != S_OK; ++number) {
        const bool met = Under({"write", number, EIO}, [&] { result = document.Export(path); });
        EXPECT_EQ(result, met ? kFailed : S_OK);
        EXPECT_TRUE(bytes.starts_with(ReadBytes(path)));
    }
    EXPECT_GT(number, 10);
}

TEST(LinuxFile, RefusesPipesAndWhatItMayNotOpen)
{
    const Folder folder;
    const CString pipe = folder / L"pipe", closed = folder / L"closed";
    ASSERT_EQ(mkfifo(PathOf(pipe).c_str(), 0600), 0);
    WriteBytes(closed, "FESTWERT a\n\n");
    std::filesystem::permissions(PathOf(closed), std::filesystem::perms::none);
    const int reader = open(PathOf(pipe).c_str(), O_RDONLY | O_NONBLOCK);
    // Permissions do not apply to root.
    const uid_t user = geteuid();
    for (const UINT flags : {kRead, kCreate}) {
        EXPECT_EQ(CauseOf(pipe, flags), CFileException::accessDenied);
        ASSERT_EQ(user == 0 ? seteuid(65534) : 0, 0);
        EXPECT_EQ(CauseOf(closed, flags), CFileException::accessDenied);
        ASSERT_EQ(seteuid(user), 0);
    }
    close(reader);
    // Its low 32 bits are those of an empty file.
    WriteBytes(folder / L"large", "");
    std::filesystem::resize_file(PathOf(folder / L"large"), 1ULL << 34);
    EXPECT_EQ(CauseOf(folder / L"large", kRead), CFileException::fileTooLarge);
}

TEST(LinuxFile, IsFreeAfterItsCloseWhileAChildLives)
{
    const Folder folder;
    const CString path = folder / L"file";
    WriteBytes(path, "kept");
    for (const bool byDestructor : {false, true}) {
        auto file = std::make_unique<CFile>(path, kRead);
        const Child child([] {});
        EXPECT_EQ(CauseOf(path, kRead), CFileException::sharingViolation);
        byDestructor ? file.reset() : file->Close();
        EXPECT_EQ(CauseOf(path, kRead), CFileException::none) << byDestructor;
    }
    // When the child closes the file, it stays open in the parent.
    CFile file(path, kRead);
    const Child child([&] { file.Close(); });
    EXPECT_EQ(CauseOf(path, kCreate), CFileException::sharingViolation);
    EXPECT_EQ(ReadBytes(path), "kept");
}

TEST(LinuxFile, StaysBelow2GiB)
{
    const Folder folder;
    const CString path = folder / L"file";
    PravFile file(path, kCreate);
    const char byte = 'x';
    writesNothing = true;
    file.Write(&byte, std::numeric_limits<std::int32_t>::max() - 8);
    file.WriteText(L"a\n");
    EXPECT_THROW(DCMFestwert().Export(file), CFileException);
    file.Write("12345", 5);
    try {
        file.Write(&byte, 1);
        ADD_FAILURE() << "written";
    } catch (const CFileException& error) {
        EXPECT_EQ(error.m_cause, CFileException::fileTooLarge);
        EXPECT_EQ(error.m_strFileName, path);
    }
    writesNothing = false;
}

TEST(LinuxFile, ReportsThatTheFileBeforeCouldNotBeClosed)
{
    const Folder folder;
    CFile file(folder / L"before", kCreate);
    for (CFileException error;
         CFileException * record : {&error, static_cast<CFileException*>(nullptr)}) {
        EXPECT_TRUE(file.Open(folder / L"before", kCreate));
        EXPECT_TRUE(Under({"close", 1, EIO}, [&] {
            EXPECT_FALSE(file.Open(folder / L"next", kCreate, record));
            EXPECT_TRUE(error.m_cause == CFileException::hardIO && error.m_lOsError == EIO);
            EXPECT_EQ(error.m_strFileName, folder / L"before");
            EXPECT_TRUE(file.Open(folder / L"before", kCreate)) << "for the count of open files";
        }));
    }
}

TEST(LinuxFile, IsNotInheritedAndMayHaveAnyHandle)
{
    const Folder folder;
    const int input = dup(STDIN_FILENO);
    close(STDIN_FILENO);
    CFile file(folder / L"file", kCreate);
    EXPECT_EQ(fcntl(STDIN_FILENO, F_GETFD), FD_CLOEXEC);
    CFileStatus status;
    EXPECT_TRUE(file.GetStatus(status));
    file.Write("a", 1);
    EXPECT_EQ(file.GetLength(), 1U);
    file.Close();
    EXPECT_EQ(fcntl(STDIN_FILENO, F_GETFD), -1);
    const DCMConverter document;
    inherited = false;
    for (const wchar_t* const name : {L"new", L"file"}) {
        dcm::Report report;
        EXPECT_EQ(dcm::Save(document, folder / name, report), S_OK);
        EXPECT_EQ(ReadBytes(folder / name), ExportBytes(document));
        EXPECT_EQ(fcntl(STDIN_FILENO, F_GETFD), -1) << dcm::ToUtf8(name);
    }
    EXPECT_FALSE(inherited);
    dup2(input, STDIN_FILENO);
    close(input);
}

TEST(LinuxFile, AsksForLargePagesOnlyInMemoryOfItsOwn)
{
    const Folder folder;
    const CString path = folder / L"a";
    WriteBytes(path, "\n");
    // Small pieces come from the heap, which the host goes on using.
    for (const auto& [size, advised] : {std::pair(100'000, 0), {3 << 20, 0}, {8 << 20, 1}}) {
        std::filesystem::resize_file(PathOf(path), static_cast<std::uintmax_t>(size));
        advices = 0;
        PravFile(path, kRead);
        EXPECT_EQ(advices, advised) << size;
    }
}

TEST(LinuxFile, ReportsAFullDevice)
{
    EXPECT_EQ(DCMConverter().Export(L"/dev/full"), E_UNEXPECTED);
    EXPECT_EQ(DCMConverter().Export(L"/dev/null"), S_OK);
    EXPECT_EQ(DCMConverter().Import(L"/dev/null"), S_OK);
}

TEST(LinuxFile, ReportsThatItCannotBeRead)
{
    const Folder folder;
    const CString path = folder / L"in.dcm";
    WriteBytes(path, "x");
    DCMConverter document;
    dcm::Report report;
    Under({"read", 1, EIO}, [&] { EXPECT_EQ(dcm::Import(document, path, report), E_UNEXPECTED); });
    EXPECT_EQ(report.Count(), 1U);
    EXPECT_EQ(report.Count("cannot-read"), 1U);
}

TEST(Save, LeavesTheOldFileWhenACallFails)
{
    const Folder folder;
    const CString path = folder / L"out.dcm";
    const std::filesystem::path place = PathOf(path).parent_path();
    DCMConverter document;
    ASSERT_EQ(ImportBytes(document, ReadBytes(CString(DCM_ALL_KINDS))), S_OK);
    const auto files = [&] {
        return std::distance(std::filesystem::directory_iterator(place), {});
    };
    for (const char* const call : {"readlink", "open", "fstat", "fchmod", "ftruncate", "write",
                                   "fsync", "close", "rename"}) {
        bool met = true;
        for (int number = 1; met; ++number) {
            SCOPED_TRACE(call + std::to_string(number));
            WriteBytes(path, "old");
            dcm::Report report;
            HRESULT result = S_OK;
            met = Under({call, number, EIO}, [&] { result = dcm::Save(document, path, report); });
            EXPECT_EQ(files(), 1);
            const std::string now = ReadBytes(path);
            if (result == S_OK) {
                EXPECT_EQ(now, ExportBytes(document));
                EXPECT_EQ(report.Count(), 0U);
            } else {
                EXPECT_TRUE(met);
                EXPECT_EQ(now, "old");
                EXPECT_EQ(report.Count("cannot-open") + report.Count("cannot-write"), 1U);
                const std::wstring_view words = report.Findings().at(0).message;
                EXPECT_NE(words.find(L"): " + std::wstring(path.View()) + L":"), words.npos);
            }
        }
    }
    // Files are not flushed everywhere.
    for (const auto& [error, expected] : {std::pair(EIO, kFailed), {EINVAL, S_OK}, {EINTR, S_OK}}) {
        dcm::Report report;
        HRESULT result = S_OK;
        EXPECT_TRUE(
            Under({"fsync", 1, error}, [&] { result = dcm::Save(document, path, report); }));
        EXPECT_EQ(result, expected) << error;
    }
}

TEST(Save, KeepsLinksAndModes)
{
    const Folder folder;
    const DCMConverter document;
    const std::string content = ExportBytes(document);
    dcm::Report report;
    const CString file = folder / L"file", first = folder / L"first", second = folder / L"second";
    namespace fs = std::filesystem;
    fs::create_symlink(PathOf(second), PathOf(first));
    fs::create_symlink("file", PathOf(second));
    // The second time the file is there.
    for (const auto mode : {fs::perms{0}, fs::perms(0640)}) {
        if (mode != fs::perms{0})
            fs::permissions(PathOf(file), mode);
        EXPECT_EQ(dcm::Save(document, first, report), S_OK);
        EXPECT_TRUE(fs::is_symlink(PathOf(first)) && fs::is_symlink(PathOf(second)));
        EXPECT_EQ(ReadBytes(file), content);
    }
    EXPECT_EQ(fs::status(PathOf(file)).permissions(), fs::perms(0640));
    // As many links as the system follows, and one more.
    CString last = first;
    for (int links = 2; links < 41; ++links) {
        const CString next = last + L"_";
        EXPECT_EQ(dcm::Save(document, last, report), S_OK) << links;
        fs::create_symlink(PathOf(last), PathOf(next));
        last = next;
    }
    EXPECT_EQ(dcm::Save(document, last, report), E_UNEXPECTED);
    // A name of bytes that are no UTF-8, and links in a circle.
    fs::remove(PathOf(second));
    fs::create_symlink("\xff", PathOf(second));
    EXPECT_EQ(dcm::Save(document, second, report), E_UNEXPECTED);
    fs::remove(PathOf(second));
    fs::create_symlink("second", PathOf(second));
    EXPECT_EQ(dcm::Save(document, first, report), E_UNEXPECTED);
    EXPECT_NE(report.Findings().at(0).message.View().find(L"(badPath)"), std::wstring_view::npos);
}
