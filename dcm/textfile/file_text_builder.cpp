#include "dcm/textfile/file_text_builder.h"

#include "dcm/platform/thread_code_page.h"

#include <algorithm>
#include <limits>

namespace dcm {

FileTextBuilder FileTextBuilder::ForFile()
{
    return {ThreadEncoding().value_or(Encoding::kUtf8), true};
}

FileTextBuilder& FileTextBuilder::Append(std::wstring_view text)
{
    // Line feeds are rare, so what is between them is encoded in one piece.
    for (;;) {
        const std::size_t lineFeed = m_forFile ? text.find(L'\n') : text.npos;
        const std::wstring_view line = text.substr(0, lineFeed);
        char* const to = Extend(line.size() * MaxBytes(m_encoding));
        EndExtend(Encode(line, m_encoding, to));
        if (lineFeed == text.npos)
            return *this;
        EndLine();
        text.remove_prefix(lineFeed + 1);
    }
}

FileTextBuilder& FileTextBuilder::EndLine()
{
    char* to = Extend(2);
    if (m_forFile && !Bytes().ends_with('\r'))
        *to++ = '\r';
    *to++ = '\n';
    EndExtend(to);
    return *this;
}

std::string_view FileTextBuilder::BytesOfFile(std::string& converted) const
{
    if (ThreadEncoding())
        return Bytes();
    converted = Utf8ToThreadCodePage(Bytes());
    return converted;
}

void FileTextBuilder::MakeRoom(std::size_t room)
{
    // Doubling the capacity copies a text that grows piece by piece only a few times.
    constexpr std::size_t least = 4096;
    const std::size_t capacity = std::max({least, 2 * m_capacity, m_size + room});
    std::unique_ptr<char[]> bytes(new char[capacity]);
    std::copy_n(m_bytes.get(), m_size, bytes.get());
    m_bytes = std::move(bytes);
    m_capacity = capacity;
}

void WriteText(const FileTextBuilder& text, CFile& file)
{
    std::string converted;
    const std::string_view bytes = text.BytesOfFile(converted);
    // A count that is cut off here is still one that a file has no room for.
    constexpr std::size_t most = std::numeric_limits<UINT>::max();
    if (!bytes.empty())
        file.Write(bytes.data(), static_cast<UINT>(std::min(bytes.size(), most)));
}

} // namespace dcm
