#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cfile.h"
#include "dcm/platform/cstring.h"

#include <memory>

namespace dcm {
struct BlockIo;
} // namespace dcm

/// A text file in the ANSI code page: read as a whole and handed out line by line, or written text
/// by text with CR LF line ends.
///
/// The content ends at the first zero byte. Only a line feed ends a line; text after the last one
/// is not handed out. A byte-order mark is text like any other.
class DCM_API PravFile : public CFile
{
public:
    /// No open file, no content.
    PravFile() noexcept;
    /// Opens the file and, unless `flags` has the write flag, loads its text. Throws
    /// `CFileException` when that fails.
    PravFile(const CString& path, UINT flags);
    ~PravFile() override;

    /// Closes the file that is open, then does what the constructor does. Returns FALSE, and fills
    /// `error` unless it is null, when the file cannot be opened. Throws when the text cannot be
    /// loaded; the file is closed then.
    BOOL Open(const wchar_t* path, UINT flags, CFileException* error = nullptr) override;

    /// Hands out the next line without its line end: 1, or 0 and an empty line when there is none.
    int ReadLine(CString& line);

    /// Writes `text` at the file's position in one piece: each line feed, with or without a
    /// carriage return before it, as CR LF; a zero, and characters that the thread's code page
    /// lacks, as `?`. Returns 1; throws `CFileException` when not all of it could be written.
    int WriteText(const CString& text);

protected:
    /// Loads the text of the open file, or none when `flags` has the write flag or no file is open.
    /// Throws `CFileException` when reading fails.
    void LoadContent(UINT flags);

private:
    friend struct dcm::BlockIo;
    struct Content;

    std::unique_ptr<Content> m_pContent;
};
