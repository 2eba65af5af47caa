#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cstring.h"

#include <cstdint>
#include <stdexcept>

/// Why a file could not be opened, read, written or closed. Thrown by value. `what()` is the path
/// in UTF-8, a colon and the reason.
class DCM_API CFileException : public std::runtime_error
{
public:
    /// What kind of failure it was.
    enum Cause
    {
        /// No failure.
        none,
        /// None of those below.
        generic,
        fileNotFound,
        badPath,
        tooManyOpenFiles,
        /// No permission, or a folder or a pipe.
        accessDenied,
        /// No file is open.
        invalidFile,
        /// The device failed.
        hardIO,
        /// Another program, or another object of this one, has the file open.
        sharingViolation,
        diskFull,
        /// 2 GiB or more.
        fileTooLarge,
    };

    /// An empty error record, to be filled by `CFile::Open`.
    CFileException();
    /// One failure; the arguments become the fields below.
    CFileException(Cause cause, long osError, const CString& fileName);
    /// The same failure.
    CFileException(const CFileException&) = default;
    CFileException& operator=(const CFileException&) = default;
    ~CFileException() override;

    /// `none` in an empty record.
    Cause m_cause;
    /// The system's own number of the error, 0 when the system reported none.
    long m_lOsError;
    /// The path as it was given.
    CString m_strFileName;
};

/// What `CFile::GetStatus` reports about an open file.
struct CFileStatus
{
    /// The length in bytes.
    std::uint64_t m_size = 0;
};

/// A file that is open for exclusive use: until it is closed, every other attempt to open it with
/// this class fails, in this process and in others. A folder or a pipe is refused, and so is a file
/// of 2 GiB or more unless opening empties it.
///
/// A child process forked meanwhile shares the file. Exclusive use ends when the process that
/// opened the file closes it; closing it in the child changes nothing for the parent.
class DCM_API CFile
{
public:
    /// How a file is opened: one of the three modes, with or without `modeCreate`.
    enum OpenFlags : UINT
    {
        modeRead = 0,
        modeWrite = 1,
        modeReadWrite = 2,
        /// Creates a missing file. With `modeWrite` or `modeReadWrite` an existing one is emptied,
        /// whatever its size, unless it is open elsewhere; with `modeRead` it stays as it is.
        modeCreate = 0x1000,
    };

    /// No open file.
    CFile() noexcept;
    /// Opens the file for `flags`, a combination of `OpenFlags`; throws `CFileException` when that
    /// fails.
    CFile(const CString& path, UINT flags);
    /// An open file has one owner and cannot be copied.
    CFile(const CFile&) = delete;
    CFile& operator=(const CFile&) = delete;
    /// Closes the file if it is open. Ignores errors; call `Close` to have them reported.
    virtual ~CFile();

    /// Closes the file that is open, if any, then opens another as the constructor does. Returns 1,
    /// or 0 when either fails; `error`, unless it is null, is then filled. No file is open after a
    /// failure.
    virtual BOOL Open(const wchar_t* path, UINT flags, CFileException* error = nullptr);
    /// Fills `status` and returns 1; returns 0 when no file is open or the system reports an error.
    virtual BOOL GetStatus(CFileStatus& status) const;
    /// The length in bytes. Throws `CFileException` when no file is open or the system reports an
    /// error.
    virtual ULONGLONG GetLength() const;
    /// Reads up to `count` bytes and returns how many there were, fewer only at the end of the
    /// file. Throws `CFileException` when reading fails.
    virtual UINT Read(void* buffer, UINT count);
    /// Writes `count` bytes. Throws `CFileException` when they cannot all be written; some of them
    /// may be in the file then. A write that would bring the file to 2 GiB writes nothing and
    /// throws `fileTooLarge`.
    virtual void Write(const void* buffer, UINT count);
    /// Closes the file; does nothing when none is open. Throws `CFileException` when the system
    /// could not store all of the file, which is closed anyway.
    virtual void Close();

protected:
    /// The path as it was given.
    const CString& FilePath() const { return m_strFileName; }

private:
    [[noreturn]] void Throw(long osError) const;
    long CloseHandle() noexcept;

    std::intptr_t m_handle;
    /// Where the next byte is read or written.
    std::uint64_t m_position = 0;
    /// The process that opened the file.
    long m_process = 0;
    CString m_strFileName;
};
