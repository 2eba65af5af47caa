#include "dcm/textfile/pravfile.h"

#include "dcm/textfile/file_text.h"
#include "dcm/textfile/file_text_builder.h"
#include "dcm/textfile/pravfile_content.h"

#include <cstdint>
#include <limits>
#include <string_view>
#include <utility>

namespace {

constexpr ULONGLONG kSizeMax = std::numeric_limits<std::int32_t>::max();

} // namespace

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
            // The file is closed anyway. The host needs to know why it could not be loaded.
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
    const auto size = static_cast<std::size_t>(status.m_size);
    dcm::TextBuffer bytes(size);
    bytes.EndAt(Read(bytes.Data(), static_cast<UINT>(size)));
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

int PravFile::WriteText(const CString& text)
{
    auto builder = dcm::FileTextBuilder::ForFile();
    dcm::WriteText(builder.Append(text), *this);
    return 1;
}
