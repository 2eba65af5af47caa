#include "dcm/textfile/pravfile.h"

#include <cstddef>
#include <cstring>
#include <memory>
#include <utility>

PravFile::PravFile() noexcept : m_nReadPos(0)
{}

PravFile::PravFile(const CString& path, UINT flags) : CFile(path, flags), m_nReadPos(0)
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
    const auto length = static_cast<UINT>(GetLength());
    auto bytes = std::make_unique_for_overwrite<char[]>(length);
    std::size_t size = Read(bytes.get(), length);
    if (const void* const zero = std::memchr(bytes.get(), '\0', size))
        size = static_cast<std::size_t>(static_cast<const char*>(zero) - bytes.get());
    m_content = dcm::FileTextFromThreadCodePage(std::move(bytes), size);
}

bool PravFile::TakeLine(std::string_view& line)
{
    const char* const content = m_content.bytes.get();
    const char* const start = content + m_nReadPos;
    const char* const end = content + m_content.size;
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

bool PravFile::ReadBlock(CString& block)
{
    block.Empty();
    // The lines move together over the carriage returns between them, so that the block can be
    // widened as one piece.
    char* const start = m_content.bytes.get() + m_nReadPos;
    char* end = start;
    std::string_view line;
    while (TakeLine(line)) {
        if (line.empty()) {
            dcm::AppendWide(block, {start, end}, m_content.encoding);
            return true;
        }
        std::memmove(end, line.data(), line.size());
        end += line.size();
        *end++ = '\n';
    }
    return false;
}

int PravFile::WriteText(const CString& text)
{
    std::wstring_view rest = text;
    // A text of nothing but line feeds becomes twice as long.
    dcm::TextEncoder encoder(2 * rest.size());
    for (;;) {
        const std::size_t end = rest.find(L'\n');
        std::wstring_view line = rest.substr(0, end);
        if (end == rest.npos) {
            encoder.Append(line);
            break;
        }
        if (line.ends_with(L'\r'))
            line.remove_suffix(1);
        encoder.Append(line);
        encoder.Append(L"\r\n");
        rest.remove_prefix(end + 1);
    }
    const std::string_view bytes = encoder.Finish();
    if (!bytes.empty())
        Write(bytes.data(), static_cast<UINT>(bytes.size()));
    return 1;
}
