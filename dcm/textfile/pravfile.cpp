#include "dcm/textfile/pravfile.h"

#include "dcm/platform/file_text_builder.h"
#include "dcm/platform/system_file.h"

#include <algorithm>
#include <cstddef>
#include <cstring>
#include <limits>
#include <string>
#include <utility>

namespace {

/// Text of 2 GiB and more has no place in a file of this format; UTF-8 may become that long where
/// the file is not.
void CheckSize(ULONGLONG size)
{
    if (size > std::numeric_limits<std::int32_t>::max())
        throw CFileException(CFileException::fileTooLarge, 0, CString());
}

/// Cuts the next line off, without its line feed and the carriage returns before that. A zero, the
/// one behind the text if there is no other, ends what can be found.
bool TakeLine(std::string_view& rest, std::string_view& line)
{
    const char* const lineFeed = rest.empty() ? nullptr : std::strchr(rest.data(), '\n');
    if (lineFeed == nullptr)
        return false;
    line = {rest.data(), lineFeed};
    while (line.ends_with('\r'))
        line.remove_suffix(1);
    rest.remove_prefix(static_cast<std::size_t>(lineFeed + 1 - rest.data()));
    return true;
}

} // namespace

PravFile::PravFile() noexcept = default;

PravFile::PravFile(const CString& path, UINT flags) : CFile(path, flags)
{
    LoadContent(flags);
}

PravFile::~PravFile() = default;

BOOL PravFile::Open(const wchar_t* path, UINT flags, CFileException* error)
{
    DropContent();
    const BOOL opened = CFile::Open(path, flags, error);
    LoadContent(flags);
    return opened;
}

void PravFile::LoadContent(UINT flags)
{
    DropContent();
    CFileStatus status;
    if (!GetStatus(status) || (flags & modeWrite) != 0)
        return;
    const ULONGLONG length = GetLength();
    CheckSize(length);
    dcm::FileText content(length, dcm::Encoding::kWindows1252);
    char* const bytes = content.bytes.get();
    dcm::system::ExpectToFill(bytes, length);
    content.EndAt(Read(bytes, static_cast<UINT>(length)));
    content = dcm::FileTextFromThreadCodePage(std::move(content));
    CheckSize(content.size);
    m_content = std::move(content);
}

int PravFile::ReadLine(CString& line)
{
    line.Empty();
    std::string_view rest = Rest();
    std::string_view bytes;
    if (!TakeLine(rest, bytes))
        return 0;
    KeepRest(rest);
    dcm::AppendWide(line, bytes, m_content.encoding);
    return 1;
}

bool PravFile::ReadBlock()
{
    m_block.Clear();
    std::string_view rest = Rest();
    std::string_view line;
    bool more = false;
    while ((more = TakeLine(rest, line)) && !line.empty())
        m_block.AddLine(line);
    KeepRest(rest);
    return more;
}

int PravFile::WriteText(const CString& text)
{
    dcm::FileTextBuilder builder = dcm::FileTextBuilder::ForFile();
    WriteText(builder.Append(text));
    return 1;
}

void PravFile::WriteText(const dcm::FileTextBuilder& text)
{
    std::string converted;
    const std::string_view bytes = dcm::ToThreadCodePage(text.Bytes(), converted);
    CheckSize(bytes.size());
    if (!bytes.empty())
        Write(bytes.data(), static_cast<UINT>(bytes.size()));
}
