#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cstring.h"

#include <cstdint>
#include <stdexcept>

/// Why a file could not be opened, read, written or closed. Thrown by value.
class DCM_API CFileException : public std::runtime_error
{
public:
    /// What kind of failure it was.
    enum Cause
    {
        none,
        generic,
        fileNotFound,
        badPath,
        tooManyOpenFiles,
        accessDenied,
        invalidFile,
        hardIO,
        sharingViolation,
        diskFull,
        fileTooLarge,
    };

    /// An empty error record, to be filled by `CFile::Open`.
    CFileException();
    /// One failure; the fields below are what they are given here.
    CFileException(Cause cause, long osError, const CString& fileName);
    /// The same failure.
    CFileException(const CFileException&) = default;
    CFileException& operator=(const CFileException&) = default;
    ~CFileException() override;

    /// `none` in an empty record.
    Cause m_cause;
    /// The system's own number of the error, 0 when the system had no part in it.
    long m_lOsError;
    /// The path as it was given.
    CString m_strFileName;
};

/// What `CFile::GetStatus` tells of an open file.
struct CFileStatus
{
    /// In bytes.
    std::uint64_t m_size = 0;
};

/// A file opened for exclusive use: while it is open, opening it again fails, here and in other
/// programs that ask. A folder, a pipe or a file of 2 GiB or more is refused.
class DCM_API CFile
{
public:
    /// How a file is opened; one of the modes, with or without `modeCreate`.
    enum OpenFlags : UINT
    {
        modeRead = 0,
        modeWrite = 1,
        modeReadWrite = 2,
        /// Creates a missing file; an existing one is emptied once nobody else has it open.
        modeCreate = 0x1000,
    };

    /// No open file.
    CFile() noexcept;
    /// Opens the file; a failure is thrown as `CFileException`.
    CFile(const CString& path, UINT flags);
    /// A file has one owner.
    CFile(const CFile&) = delete;
    CFile& operator=(const CFile&) = delete;
    /// Closes the file if it is open and keeps quiet about a failure: call `Close` to hear of it.
    virtual ~CFile();

    /// Opens the file, after closing one that is open. On a failure returns FALSE and fills
    /// `error`, unless that is null.
    virtual BOOL Open(const wchar_t* path, UINT flags, CFileException* error = nullptr);
    /// Returns FALSE when no file is open or the system does not answer.
    virtual BOOL GetStatus(CFileStatus& status) const;
    /// The length in bytes; throws `CFileException` when no file is open.
    virtual ULONGLONG GetLength() const;
    /// Reads up to `count` bytes and returns how many there were; fewer only at the file's end.
    /// Throws `CFileException`.
    virtual UINT Read(void* buffer, UINT count);
    /// Writes all of `count` bytes or throws `CFileException`.
    virtual void Write(const void* buffer, UINT count);
    /// Closes the file; throws `CFileException` when the system could not store all of it. Does
    /// nothing when no file is open.
    virtual void Close();

private:
    [[noreturn]] void Throw(long osError) const;

    std::intptr_t m_handle;
    CString m_strFileName;
};
