#include "dcm/platform/cfile.h"

#include "dcm/platform/codepage.h"
#include "dcm/platform/system_file.h"

#include <string>
#include <system_error>

namespace {

std::string Describe(CFileException::Cause cause, long osError, const CString& fileName)
{
    std::string text = dcm::ToUtf8(fileName);
    text += ": ";
    // The system's words, such as "resource temporarily unavailable", do not say what to do.
    if (cause == CFileException::sharingViolation)
        return text += "another program or document has the file open";
    if (osError != 0)
        return text += std::system_category().message(static_cast<int>(osError));
    switch (cause) {
    case CFileException::invalidFile:
        return text += "not an open file";
    case CFileException::accessDenied:
        return text += "not a file that can be read or written as a whole";
    case CFileException::fileTooLarge:
        return text += "2 GiB or larger";
    case CFileException::diskFull:
        return text += "no room for all of the text";
    default:
        return text += "file error";
    }
}

} // namespace

CFileException::CFileException() : std::runtime_error(""), m_cause(none), m_lOsError(0)
{}

CFileException::CFileException(Cause cause, long osError, const CString& fileName)
    : std::runtime_error(Describe(cause, osError, fileName)), m_cause(cause), m_lOsError(osError),
      m_strFileName(fileName)
{}

CFileException::~CFileException() = default;

CFile::CFile() noexcept : m_handle(dcm::system::kNoFile)
{}

CFile::CFile(const CString& path, UINT flags) : CFile()
{
    CFileException error;
    if (!CFile::Open(path, flags, &error))
        throw CFileException(error);
}

CFile::~CFile()
{
    if (m_handle != dcm::system::kNoFile)
        CloseHandle();
}

BOOL CFile::Open(const wchar_t* path, UINT flags, CFileException* error)
{
    try {
        Close();
    } catch (const CFileException& failure) {
        if (error != nullptr)
            *error = failure;
        return 0;
    }
    m_strFileName = CString(path);
    long osError = 0;
    CFileException::Cause refusal = CFileException::none;
    m_handle = dcm::system::OpenFile(m_strFileName, flags, osError, refusal);
    if (m_handle != dcm::system::kNoFile) {
        m_position = 0;
        m_process = dcm::system::ProcessNumber();
        return 1;
    }
    if (error != nullptr) {
        const auto cause =
            refusal != CFileException::none ? refusal : dcm::system::CauseOf(osError);
        *error = CFileException(cause, osError, m_strFileName);
    }
    return 0;
}

BOOL CFile::GetStatus(CFileStatus& status) const
{
    const bool known =
        m_handle != dcm::system::kNoFile && dcm::system::FileLength(m_handle, status.m_size) == 0;
    return known ? 1 : 0;
}

ULONGLONG CFile::GetLength() const
{
    std::uint64_t length = 0;
    if (m_handle == dcm::system::kNoFile)
        Throw(0);
    if (const long error = dcm::system::FileLength(m_handle, length))
        Throw(error);
    return length;
}

UINT CFile::Read(void* buffer, UINT count)
{
    if (m_handle == dcm::system::kNoFile)
        Throw(0);
    auto* const bytes = static_cast<char*>(buffer);
    std::size_t total = 0;
    while (total < count) {
        std::size_t done = 0;
        if (const long error = dcm::system::ReadSome(m_handle, bytes + total, count - total, done))
            Throw(error);
        if (done == 0)
            break;
        total += done;
        m_position += done;
    }
    return static_cast<UINT>(total);
}

void CFile::Write(const void* buffer, UINT count)
{
    if (m_handle == dcm::system::kNoFile)
        Throw(0);
    if (m_position + count >= dcm::system::kSizeLimit)
        throw CFileException(CFileException::fileTooLarge, 0, m_strFileName);
    const auto* const bytes = static_cast<const char*>(buffer);
    std::size_t total = 0;
    while (total < count) {
        std::size_t done = 0;
        if (const long error = dcm::system::WriteSome(m_handle, bytes + total, count - total, done))
            Throw(error);
        if (done == 0)
            throw CFileException(CFileException::diskFull, 0, m_strFileName);
        total += done;
        m_position += done;
    }
}

void CFile::Close()
{
    if (m_handle == dcm::system::kNoFile)
        return;
    if (const long error = CloseHandle())
        Throw(error);
}

long CFile::CloseHandle() noexcept
{
    const auto handle = m_handle;
    m_handle = dcm::system::kNoFile;
    // A forked child leaves the file to its parent.
    return dcm::system::CloseFile(handle, dcm::system::ProcessNumber() == m_process);
}

void CFile::Throw(long osError) const
{
    const auto cause = osError != 0 ? dcm::system::CauseOf(osError) : CFileException::invalidFile;
    throw CFileException(cause, osError, m_strFileName);
}
