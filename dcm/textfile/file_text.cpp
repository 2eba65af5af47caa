#include "dcm/textfile/file_text.h"

#include "dcm/platform/exception.h"
#include "dcm/platform/thread_code_page.h"

#include <algorithm>
#include <limits>
#include <string>
#include <utility>

namespace dcm {

FileText FileText::OfFile(TextBuffer content)
{
    auto encoding = ThreadEncoding();
    Origin origin;
    if (!encoding) {
        const std::string_view bytes = content.Bytes();
        const std::string utf8 = ThreadCodePageToUtf8(bytes.substr(0, bytes.find('\0')));
        const Utf8Look look = LookAsUtf8(bytes.substr(0, bytes.find('\0')));
        origin = {true, HasTextAfterZero(bytes),
                  look.firstWide != bytes.npos && look.firstBad == bytes.npos};
        content = TextBuffer(utf8.size());
        std::copy(utf8.begin(), utf8.end(), content.Data());
        content.EndAt(utf8.size());
        encoding = Encoding::kUtf8;
    }
    FileText text(std::move(content), *encoding);
    text.m_origin = origin;
    text.m_shared = std::make_unique<SharedTexts>();
    return text;
}

FileText FileText::OfHost(std::wstring_view text)
{
    constexpr Encoding encoding = Encoding::kLenientUtf8;
    TextBuffer buffer(text.size() * MaxBytes(encoding));
    const char* const end = Encode(text, encoding, buffer.Data());
    buffer.EndAt(static_cast<std::size_t>(end - buffer.Data()));
    return {std::move(buffer), encoding};
}

bool HasTextAfterZero(std::string_view bytes)
{
    bytes.remove_prefix(std::min(bytes.find('\0'), bytes.size()));
    return std::any_of(bytes.begin(), bytes.end(), [](char c) { return c != '\0' && !IsWhite(c); });
}

HostBlock::HostBlock(std::wstring_view text) : m_text(FileText::OfHost(text))
{
    std::string_view rest = m_text.Bytes();
    if (rest.size() > std::numeric_limits<std::uint32_t>::max())
        ThrowResult(E_OUTOFMEMORY);
    m_block.Begin(m_text, 1);
    if (rest.starts_with('\n'))
        return;
    for (std::string_view line; TakeLine(rest, line);)
        m_block.AddLine(line);
}

} // namespace dcm
