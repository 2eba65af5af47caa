#include "dcm/platform/code_page_system.h"

#include "dcm/platform/automation.h"
#include "dcm/platform/codepage.h"
#include "dcm/platform/exception.h"

#include <limits>

namespace dcm::system {

namespace {

/// `text` with one U+FFFD for each surrogate pair: the system would take the halves of a pair that
/// the page lacks for two characters. Pages of one or two bytes a character have none of them.
CString WithoutPairs(std::wstring_view text)
{
    CString result;
    wchar_t* to = result.Extend(text.size());
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool pair = i + 1 < text.size() && IS_SURROGATE_PAIR(text[i], text[i + 1]);
        *to++ = pair ? L'\xFFFD' : text[i];
        i += pair ? 1 : 0;
    }
    result.EndExtend(to);
    return result;
}

} // namespace

unsigned DefaultCodePage()
{
    // The page that the system itself means by the thread's ANSI code page.
    CPINFOEXW info = {};
    return GetCPInfoExW(CP_THREAD_ACP, 0, &info) ? info.CodePage : GetACP();
}

bool KnowsCodePage(unsigned identifier)
{
    return IsValidCodePage(identifier) != FALSE;
}

std::string CodePageToUtf8(unsigned identifier, std::string_view bytes)
{
    if (bytes.empty())
        return {};
    if (bytes.size() > static_cast<std::size_t>(std::numeric_limits<int>::max()))
        ThrowResult(E_OUTOFMEMORY);
    const auto size = static_cast<int>(bytes.size());
    const int length = MultiByteToWideChar(identifier, 0, bytes.data(), size, nullptr, 0);
    if (length <= 0)
        ThrowResult(E_OUTOFMEMORY);
    std::wstring text(static_cast<std::size_t>(length), L'\0');
    MultiByteToWideChar(identifier, 0, bytes.data(), size, text.data(), length);
    return ToUtf8(text);
}

std::string Utf8ToCodePage(unsigned identifier, std::string_view utf8)
{
    if (utf8.empty())
        return {};
    CString text = FromUtf8(utf8);
    CPINFO info = {};
    if (GetCPInfo(identifier, &info) && info.MaxCharSize <= 2)
        text = WithoutPairs(text);
    const int length = text.GetLength();
    // A letter that the page lacks is not to become one that looks like it. Pages with shift
    // states know no such choice and refuse the flag.
    DWORD flags = WC_NO_BEST_FIT_CHARS;
    const auto convert = [&](char* to, int room) {
        return WideCharToMultiByte(identifier, flags, text, length, to, room, nullptr, nullptr);
    };
    int size = convert(nullptr, 0);
    if (size <= 0 && GetLastError() == ERROR_INVALID_FLAGS) {
        flags = 0;
        size = convert(nullptr, 0);
    }
    if (size <= 0)
        ThrowResult(E_OUTOFMEMORY);
    std::string bytes(static_cast<std::size_t>(size), '\0');
    convert(bytes.data(), size);
    return bytes;
}

} // namespace dcm::system
