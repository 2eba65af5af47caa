#include "dcm/textfile/pravfile.h"

#include <algorithm>
#include <cstddef>
#include <cstring>
#include <memory>
#include <string>
#include <utility>

namespace {

/// `text` with CR LF as its only line end. A carriage return that no line feed follows stays.
CString WithCrLf(std::wstring_view text)
{
    const auto lineFeeds = static_cast<std::size_t>(std::count(text.begin(), text.end(), L'\n'));
    CString result;
    wchar_t* to = result.Extend(text.size() + lineFeeds);
    for (;;) {
        const std::size_t end = text.find(L'\n');
        std::wstring_view line = text.substr(0, end);
        const bool paired = end != text.npos && line.ends_with(L'\r');
        if (paired)
            line.remove_suffix(1);
        to = std::copy(line.begin(), line.end(), to);
        if (end == text.npos)
            break;
        *to++ = L'\r';
        *to++ = L'\n';
        text.remove_prefix(end + 1);
    }
    result.EndExtend(to);
    return result;
}

} // namespace

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
    const auto start = static_cast<std::size_t>(m_nReadPos);
    const std::string_view left = m_content.View().substr(start);
    const std::size_t end = left.find('\n');
    if (end == left.npos)
        return false;
    m_nReadPos = static_cast<std::int32_t>(start + end + 1);
    line = left.substr(0, end);
    while (line.ends_with('\r'))
        line.remove_suffix(1);
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
    std::string_view line;
    while (TakeLine(line)) {
        if (line.empty())
            return true;
        dcm::AppendWide(block, line, m_content.encoding);
        block += L"\n";
    }
    return false;
}

int PravFile::WriteText(const CString& text)
{
    const std::string bytes = dcm::Narrow(WithCrLf(text));
    if (!bytes.empty())
        Write(bytes.data(), static_cast<UINT>(bytes.size()));
    return 1;
}
