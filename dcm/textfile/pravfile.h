#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/cfile.h"
#include "dcm/platform/codepage.h"
#include "dcm/platform/cstring.h"
#include "dcm/textfile/fileblock.h"

#include <cstdint>
#include <string_view>

namespace dcm {
struct DocumentIo;
} // namespace dcm

/// A text file in the ANSI code page: read as a whole and handed out line by line, or written text
/// by text with CR LF line ends.
///
/// The content ends at the first zero byte. Only a line feed ends a line; text behind the last one
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

    /// The same for an object that is there already. Returns what opening the file came to; a
    /// failed read is thrown.
    BOOL Open(const wchar_t* path, UINT flags, CFileException* error = nullptr) override;

    /// Hands out the next line without its line end: 1, or 0 and an empty line when there is none.
    int ReadLine(CString& line);

    /// Writes `text` at the file's position in one piece: each line feed, with or without a
    /// carriage return before it, as CR LF, and characters that the thread's code page lacks as
    /// `?`. Returns 1; throws `CFileException` when not all of it could be written.
    int WriteText(const CString& text);
    /// The same for a text that was composed for a file by this thread.
    void WriteText(const dcm::FileTextBuilder& text);

protected:
    /// Loads the text of the open file, or none when `flags` has the write flag or no file is open.
    /// Throws `CFileException` when reading fails.
    void LoadContent(UINT flags);

private:
    friend class DCMConverter;
    friend struct dcm::DocumentIo;

    /// Takes the lines up to the next empty one; none where two empty lines meet. Returns false
    /// when no further empty line follows: what is left is dropped.
    bool ReadBlock();
    /// The lines taken last, valid until the next call or until the file is opened anew.
    const dcm::FileBlock& Block() const { return m_block; }

    void DropContent() noexcept
    {
        m_content = {};
        m_nReadPos = 0;
    }
    /// The content that has not been handed out.
    std::string_view Rest() const
    {
        return m_content.Bytes().substr(static_cast<std::size_t>(m_nReadPos));
    }
    void KeepRest(std::string_view rest)
    {
        m_nReadPos = static_cast<std::int32_t>(m_content.size - rest.size());
    }

    /// Bytes, as wide text takes four times the memory: only what is kept of them is widened.
    dcm::FileText m_content;
    std::int32_t m_nReadPos = 0;
    dcm::FileBlock m_block{m_content};
};
