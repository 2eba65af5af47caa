#include "dcm/platform/system_file.h"

#include <algorithm>
#include <new>

namespace dcm::system {

namespace {

/// How many bytes one call to the system moves at most.
constexpr std::size_t kMostAtOnce = std::size_t{1} << 30;

HANDLE HandleOf(FileHandle file)
{
    return reinterpret_cast<HANDLE>(file);
}

long LastError()
{
    return static_cast<long>(GetLastError());
}

/// Closes the file unless it is released.
class OpeningFile
{
public:
    explicit OpeningFile(HANDLE file) : m_file(file) {}
    OpeningFile(const OpeningFile&) = delete;
    OpeningFile& operator=(const OpeningFile&) = delete;
    ~OpeningFile()
    {
        if (m_file != INVALID_HANDLE_VALUE)
            CloseHandle(m_file);
    }

    HANDLE Get() const { return m_file; }
    FileHandle Release()
    {
        const HANDLE file = m_file;
        m_file = INVALID_HANDLE_VALUE;
        return reinterpret_cast<FileHandle>(file);
    }

private:
    HANDLE m_file;
};

} // namespace

FileHandle OpenFile(const CString& path, UINT flags, long& error, CFileException::Cause& refusal)
{
    const DWORD access = (flags & CFile::modeWrite) != 0       ? GENERIC_WRITE
                         : (flags & CFile::modeReadWrite) != 0 ? GENERIC_READ | GENERIC_WRITE
                                                               : GENERIC_READ;
    const bool create = (flags & CFile::modeCreate) != 0;
    constexpr DWORD kShareWithNobody = 0;
    OpeningFile file(CreateFileW(path, access, kShareWithNobody, nullptr,
                                 create ? OPEN_ALWAYS : OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL,
                                 nullptr));
    if (file.Get() == INVALID_HANDLE_VALUE) {
        error = LastError();
        return kNoFile;
    }
    const DWORD type = GetFileType(file.Get());
    // A character device such as NUL is written like a file and never locked.
    if (type == FILE_TYPE_CHAR)
        return file.Release();
    if (type != FILE_TYPE_DISK) {
        refusal = CFileException::accessDenied;
        return kNoFile;
    }
    LARGE_INTEGER length = {};
    if (!GetFileSizeEx(file.Get(), &length)) {
        error = LastError();
        return kNoFile;
    }
    const bool emptied = create && (access & GENERIC_WRITE) != 0;
    if (!emptied && static_cast<std::uint64_t>(length.QuadPart) >= kSizeLimit) {
        refusal = CFileException::fileTooLarge;
        return kNoFile;
    }
    // Only now: a file that is refused keeps its content.
    if (emptied && !SetEndOfFile(file.Get())) {
        error = LastError();
        return kNoFile;
    }
    return file.Release();
}

long ProcessNumber() noexcept
{
    return static_cast<long>(GetCurrentProcessId());
}

long FileLength(FileHandle file, std::uint64_t& length) noexcept
{
    length = 0;
    // A character device has no length, and the system no answer.
    if (GetFileType(HandleOf(file)) == FILE_TYPE_CHAR)
        return 0;
    LARGE_INTEGER size = {};
    if (!GetFileSizeEx(HandleOf(file), &size))
        return LastError();
    length = static_cast<std::uint64_t>(size.QuadPart);
    return 0;
}

long ReadSome(FileHandle file, void* buffer, std::size_t count, std::size_t& done) noexcept
{
    DWORD got = 0;
    const auto wanted = static_cast<DWORD>(std::min(count, kMostAtOnce));
    if (!ReadFile(HandleOf(file), buffer, wanted, &got, nullptr))
        return LastError();
    done = got;
    return 0;
}

long WriteSome(FileHandle file, const void* buffer, std::size_t count, std::size_t& done) noexcept
{
    DWORD put = 0;
    const auto wanted = static_cast<DWORD>(std::min(count, kMostAtOnce));
    if (!WriteFile(HandleOf(file), buffer, wanted, &put, nullptr))
        return LastError();
    done = put;
    return 0;
}

char* TakeMemory(std::size_t size)
{
    return static_cast<char*>(::operator new(size));
}

void ReleaseMemory(char* memory, std::size_t /*size*/) noexcept
{
    ::operator delete(memory);
}

long CloseFile(FileHandle file, bool /*endUse*/) noexcept
{
    // A child process does not get the handle.
    return CloseHandle(HandleOf(file)) ? 0 : LastError();
}

CFileException::Cause CauseOf(long error) noexcept
{
    switch (error) {
    case ERROR_FILE_NOT_FOUND:
        return CFileException::fileNotFound;
    case ERROR_PATH_NOT_FOUND:
    case ERROR_INVALID_NAME:
    case ERROR_BAD_PATHNAME:
    case ERROR_INVALID_DRIVE:
    case ERROR_BAD_NETPATH:
    case ERROR_BAD_NET_NAME:
    case ERROR_DIRECTORY:
    case ERROR_FILENAME_EXCED_RANGE:
        return CFileException::badPath;
    case ERROR_TOO_MANY_OPEN_FILES:
        return CFileException::tooManyOpenFiles;
    case ERROR_ACCESS_DENIED:
    case ERROR_WRITE_PROTECT:
    case ERROR_NETWORK_ACCESS_DENIED:
        return CFileException::accessDenied;
    case ERROR_INVALID_HANDLE:
        return CFileException::invalidFile;
    case ERROR_CRC:
    case ERROR_SEEK:
    case ERROR_SECTOR_NOT_FOUND:
    case ERROR_READ_FAULT:
    case ERROR_WRITE_FAULT:
    case ERROR_IO_DEVICE:
        return CFileException::hardIO;
    case ERROR_SHARING_VIOLATION:
    case ERROR_LOCK_VIOLATION:
        return CFileException::sharingViolation;
    case ERROR_DISK_FULL:
    case ERROR_HANDLE_DISK_FULL:
        return CFileException::diskFull;
    case ERROR_FILE_TOO_LARGE:
        return CFileException::fileTooLarge;
    default:
        return CFileException::generic;
    }
}

} // namespace dcm::system
