#include "dcm/platform/codepage.h"

#include "dcm/platform/code_page_system.h"
#include "dcm/platform/encoding.h"
#include "dcm/platform/thread_code_page.h"

#include <cstddef>

namespace dcm {

namespace {

constexpr unsigned kWindows1252Identifier = 1252;
constexpr unsigned kLatin1Identifier = 28591;
constexpr unsigned kUtf8Identifier = 65001;

/// The code page that the thread chose; 0 until it does.
thread_local unsigned chosenCodePage = 0;

/// The encoding of a page that is built in.
std::optional<Encoding> FindEncoding(unsigned identifier)
{
    switch (identifier) {
    case kWindows1252Identifier:
        return Encoding::kWindows1252;
    case kLatin1Identifier:
        return Encoding::kLatin1;
    case kUtf8Identifier:
        return Encoding::kUtf8;
    default:
        return std::nullopt;
    }
}

} // namespace

unsigned ThreadCodePage()
{
    return chosenCodePage != 0 ? chosenCodePage : system::DefaultCodePage();
}

bool SetThreadCodePage(unsigned identifier)
{
    if (!FindEncoding(identifier) && !system::KnowsCodePage(identifier))
        return false;
    chosenCodePage = identifier;
    return true;
}

std::optional<Encoding> ThreadEncoding()
{
    return FindEncoding(ThreadCodePage());
}

std::string ThreadCodePageToUtf8(std::string_view bytes)
{
    return system::CodePageToUtf8(ThreadCodePage(), bytes);
}

std::string Utf8ToThreadCodePage(std::string_view utf8)
{
    return system::Utf8ToCodePage(ThreadCodePage(), utf8);
}

CString Widen(std::string_view bytes)
{
    if (const auto encoding = ThreadEncoding())
        return Decode(bytes, *encoding);
    return FromUtf8(ThreadCodePageToUtf8(bytes));
}

std::string ToUtf8(std::wstring_view text)
{
    std::string bytes(text.size() * MaxBytes(Encoding::kUtf8), '\0');
    char* end = bytes.data();
    for (;;) {
        // Zeros are kept.
        const std::size_t zero = text.find(L'\0');
        end = Encode(text.substr(0, zero), Encoding::kUtf8, end);
        if (zero == text.npos)
            break;
        *end++ = '\0';
        text.remove_prefix(zero + 1);
    }
    bytes.resize(static_cast<std::size_t>(end - bytes.data()));
    return bytes;
}

CString FromUtf8(std::string_view text)
{
    return Decode(text, Encoding::kUtf8);
}

} // namespace dcm
