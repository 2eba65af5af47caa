#include "dcm/platform/system_file.h"

#include "dcm/platform/codepage.h"
#include "dcm/platform/linux/lock.h"

#include <cerrno>
#include <fcntl.h>
#include <new>
#include <sys/file.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

namespace dcm::system {

namespace {

/// Memory of this size and more has pages of its own. It is twice the size of a large page.
constexpr std::size_t kOwnPages = std::size_t{4} << 20;

/// Closes the file unless it is released.
class OpeningFile
{
public:
    explicit OpeningFile(int file) : m_file(file) {}
    OpeningFile(const OpeningFile&) = delete;
    OpeningFile& operator=(const OpeningFile&) = delete;
    ~OpeningFile()
    {
        if (m_file >= 0)
            CloseFile(m_file, true);
    }

    int Get() const { return m_file; }
    int Release()
    {
        const int file = m_file;
        m_file = -1;
        return file;
    }

private:
    int m_file;
};

} // namespace

FileHandle OpenFile(const CString& path, UINT flags, long& error, CFileException::Cause& refusal)
{
    const int access = (flags & CFile::modeWrite) != 0       ? O_WRONLY
                       : (flags & CFile::modeReadWrite) != 0 ? O_RDWR
                                                             : O_RDONLY;
    const int creation = (flags & CFile::modeCreate) != 0 ? O_CREAT : 0;
    // A pipe without its other end would keep a blocking open waiting.
    const int always = O_CLOEXEC | O_NOCTTY | O_NONBLOCK;
    constexpr mode_t kReadWriteForAll = 0666;
    OpeningFile file(open(ToUtf8(path).c_str(), access | creation | always, kReadWriteForAll));
    struct stat status = {};
    if (file.Get() < 0 || fstat(file.Get(), &status) != 0) {
        error = errno;
        return kNoFile;
    }
    if (S_ISDIR(status.st_mode)) {
        error = EISDIR;
        return kNoFile;
    }
    // A character device such as /dev/full is written like a file and never locked.
    if (!S_ISREG(status.st_mode)) {
        if (S_ISCHR(status.st_mode))
            return file.Release();
        refusal = CFileException::accessDenied;
        return kNoFile;
    }
    const bool emptied = creation != 0 && access != O_RDONLY;
    if (!emptied && static_cast<std::uint64_t>(status.st_size) >= kSizeLimit) {
        refusal = CFileException::fileTooLarge;
        return kNoFile;
    }
    if (!Lock(file.Get())) {
        error = EWOULDBLOCK;
        refusal = CFileException::sharingViolation;
        return kNoFile;
    }
    // Only now: a file that somebody else uses keeps its content.
    if (emptied && ftruncate(file.Get(), 0) != 0) {
        error = errno;
        return kNoFile;
    }
    return file.Release();
}

long ProcessNumber() noexcept
{
    return getpid();
}

long FileLength(FileHandle file, std::uint64_t& length) noexcept
{
    struct stat status = {};
    if (fstat(static_cast<int>(file), &status) != 0)
        return errno;
    length = static_cast<std::uint64_t>(status.st_size);
    return 0;
}

long ReadSome(FileHandle file, void* buffer, std::size_t count, std::size_t& done) noexcept
{
    for (;;) {
        const ssize_t got = read(static_cast<int>(file), buffer, count);
        if (got >= 0) {
            done = static_cast<std::size_t>(got);
            return 0;
        }
        if (errno != EINTR)
            return errno;
    }
}

long WriteSome(FileHandle file, const void* buffer, std::size_t count, std::size_t& done) noexcept
{
    for (;;) {
        const ssize_t put = write(static_cast<int>(file), buffer, count);
        if (put >= 0) {
            done = static_cast<std::size_t>(put);
            return 0;
        }
        if (errno != EINTR)
            return errno;
    }
}

char* TakeMemory(std::size_t size)
{
    if (size < kOwnPages)
        return static_cast<char*>(::operator new(size));
    void* const memory =
        mmap(nullptr, size, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
    if (memory == MAP_FAILED)
        throw std::bad_alloc();
    madvise(memory, size, MADV_HUGEPAGE); // Only a hint.
    return static_cast<char*>(memory);
}

void ReleaseMemory(char* memory, std::size_t size) noexcept
{
    if (size < kOwnPages) {
        ::operator delete(memory);
    } else {
        munmap(memory, size);
    }
}

long CloseFile(FileHandle file, bool endUse) noexcept
{
    const int number = static_cast<int>(file);
    // Closing ends the lock only when no child has the file open. A device has no lock to end, nor
    // have some file systems: no error.
    if (endUse)
        flock(number, LOCK_UN);
    // After an interrupted close the file is closed anyway.
    return close(number) == 0 || errno == EINTR ? 0 : errno;
}

CFileException::Cause CauseOf(long error) noexcept
{
    switch (error) {
    case ENOENT:
        return CFileException::fileNotFound;
    case ENOTDIR:
    case ENAMETOOLONG:
    case ELOOP:
        return CFileException::badPath;
    case EMFILE:
    case ENFILE:
        return CFileException::tooManyOpenFiles;
    case EACCES:
    case EPERM:
    case EROFS:
    case EISDIR:
    case ETXTBSY:
        return CFileException::accessDenied;
    case EBADF:
        return CFileException::invalidFile;
    case EIO:
        return CFileException::hardIO;
    case ENOSPC:
    case EDQUOT:
        return CFileException::diskFull;
    case EFBIG:
    case EOVERFLOW:
        return CFileException::fileTooLarge;
    default:
        return CFileException::generic;
    }
}

} // namespace dcm::system
