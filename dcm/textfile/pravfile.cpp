#include "dcm/textfile/pravfile.h"

#include "dcm/platform/system_file.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/file_text.h"
#include "dcm/textfile/file_text_builder.h"

#include <cstddef>
#include <cstdint>
#include <limits>
#include <string_view>
#include <utility>

namespace {

constexpr ULONGLONG kSizeMax = std::numeric_limits<std::int32_t>::max();

} // namespace

/// The text of the open file and how much of it has been handed out.
struct PravFile::Content
{
    dcm::FileText m_strContent;
    std::int32_t m_nReadPos = 0;
    /// The number of the line at `m_nReadPos`, counted from 1.
    std::int32_t m_nLine = 1;

    std::string_view Rest() const
    {
        return m_strContent.Bytes().substr(static_cast<std::size_t>(m_nReadPos));
    }
    void SetRest(std::string_view rest)
    {
        m_nReadPos = static_cast<std::int32_t>(m_strContent.Bytes().size() - rest.size());
    }
};

PravFile::PravFile() noexcept = default;

PravFile::PravFile(const CString& path, UINT flags) : CFile(path, flags)
{
    LoadContent(flags);
}

PravFile::~PravFile() = default;

BOOL PravFile::Open(const wchar_t* path, UINT flags, CFileException* error)
{
    m_pContent.reset();
    const BOOL opened = CFile::Open(path, flags, error);
    try {
        LoadContent(flags);
    } catch (...) {
        // Without its text the file is of no use, and while it is open nobody else can open it.
        try {
            Close();
        } catch (const CFileException&) {
            // The file is closed all the same; the failure to load it is what the host is told.
        }
        throw;
    }
    return opened;
}

void PravFile::LoadContent(UINT flags)
{
    m_pContent.reset();
    CFileStatus status;
    if ((flags & modeWrite) != 0 || !GetStatus(status))
        return;
    if (status.m_size > kSizeMax)
        throw CFileException(CFileException::fileTooLarge, 0, FilePath());
    auto content = std::make_unique<Content>();
    dcm::TextBuffer bytes(status.m_size);
    dcm::system::ExpectToFill(bytes.Data(), status.m_size);
    bytes.EndAt(Read(bytes.Data(), static_cast<UINT>(status.m_size)));
    content->m_strContent = dcm::FileText::OfFile(std::move(bytes));
    // A conversion to UTF-8 may lengthen the text.
    if (content->m_strContent.Bytes().size() > kSizeMax)
        throw CFileException(CFileException::fileTooLarge, 0, FilePath());
    m_pContent = std::move(content);
}

int PravFile::ReadLine(CString& line)
{
    line.Empty();
    if (!m_pContent)
        return 0;
    std::string_view rest = m_pContent->Rest();
    std::string_view bytes;
    if (!dcm::TakeFileLine(rest, bytes))
        return 0;
    m_pContent->SetRest(rest);
    ++m_pContent->m_nLine;
    m_pContent->m_strContent.AppendWide(line, bytes);
    return 1;
}

/// Takes the lines up to the next empty one; `block` has no lines where two empty lines meet.
/// Returns false when no empty line follows: what is left is dropped.
bool PravFile::ReadBlock(dcm::FileBlock& block)
{
    if (!m_pContent)
        return false;
    block.Begin(m_pContent->m_strContent, m_pContent->m_nLine);
    std::string_view rest = m_pContent->Rest();
    const bool more = dcm::TakeBlock(rest, block);
    m_pContent->SetRest(rest);
    m_pContent->m_nLine = block.LineNumber(block.LineCount()) + (more ? 1 : 0);
    return more;
}

/// Adds the text after the last line feed to the lines before it; returns whether there is none.
bool PravFile::AddRest(dcm::FileBlock& block) const
{
    const std::string_view rest = m_pContent->Rest();
    const std::string_view line = rest.substr(0, rest.find('\0'));
    if (!line.empty())
        block.AddLine(line);
    return line.empty();
}

const dcm::FileText& PravFile::Text() const
{
    return m_pContent->m_strContent;
}

int PravFile::WriteText(const CString& text)
{
    auto builder = dcm::FileTextBuilder::ForFile();
    dcm::WriteText(builder.Append(text), *this);
    return 1;
}
