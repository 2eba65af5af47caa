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

/// Reads `length` bytes, fewer where the file ends early, and returns how many of them are text: a
/// zero ends it. That is looked for while the bytes are still near the processor.
std::size_t ReadText(CFile& file, char* bytes, std::size_t length)
{
    constexpr std::size_t most = std::size_t{256} * 1024;
    const void* zero = nullptr;
    char* to = bytes;
    for (char* const end = bytes + length; to != end;) {
        const auto wanted = std::min(static_cast<std::size_t>(end - to), most);
        const UINT count = file.Read(to, static_cast<UINT>(wanted));
        if (zero == nullptr)
            zero = std::memchr(to, '\0', count);
        to += count;
        if (count < wanted)
            break;
    }
    return static_cast<std::size_t>((zero == nullptr ? to : static_cast<const char*>(zero)) -
                                    bytes);
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
    const BOOL opened = CFile::Open(path, flags, error);
    LoadContent(flags);
    return opened;
}

void PravFile::LoadContent(UINT flags)
{
    m_content = {};
    m_nReadPos = 0;
    CFileStatus status;
    if (!GetStatus(status) || (flags & modeWrite) != 0)
        return;
    const ULONGLONG length = GetLength();
    CheckSize(length);
    dcm::FileText content(length, dcm::Encoding::kWindows1252);
    char* const bytes = content.bytes.get();
    dcm::system::ExpectToFill(bytes, length);
    content.EndAt(ReadText(*this, bytes, static_cast<std::size_t>(length)));
    content = dcm::FileTextFromThreadCodePage(std::move(content));
    CheckSize(content.size);
    m_content = std::move(content);
}

bool PravFile::TakeLine(std::string_view& line)
{
    const char* const content = m_content.bytes.get();
    const char* const start = content + m_nReadPos;
    const char* const end = content + m_content.size;
    if (start == end)
        return false;
    const auto* const lineFeed =
        static_cast<const char*>(std::memchr(start, '\n', static_cast<std::size_t>(end - start)));
    if (lineFeed == nullptr)
        return false;
    m_nReadPos = static_cast<std::int32_t>(lineFeed + 1 - content);
    const char* last = lineFeed;
    while (last != start && last[-1] == '\r')
        --last;
    line = {start, last};
    return true;
}

int PravFile::ReadLine(CString& line)
{
    line.Empty();
    std::string_view bytes;
    if (!TakeLine(bytes))
        return 0;
    dcm::AppendWide(line, bytes, m_content.encoding);
    return 1;
}

bool PravFile::ReadBlock()
{
    m_block.Clear();
    std::string_view line;
    while (TakeLine(line)) {
        if (line.empty())
            return true;
        m_block.AddLine(line.data(), line.data() + line.size());
    }
    return false;
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
