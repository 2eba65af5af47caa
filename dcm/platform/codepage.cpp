#include "dcm/platform/codepage.h"

#include "dcm/platform/code_page_system.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstring>
#include <type_traits>
#include <utility>

namespace dcm {

namespace {

constexpr unsigned kWindows1252Identifier = 1252;
constexpr unsigned kLatin1Identifier = 28591;
constexpr unsigned kUtf8Identifier = 65001;

constexpr std::uint32_t kReplacement = 0xFFFD;

/// The code page that the thread chose; 0 until it does.
thread_local unsigned chosenCodePage = 0;

unsigned ThreadCodePage()
{
    return chosenCodePage != 0 ? chosenCodePage : system::DefaultCodePage();
}

/// Whether the page is built in, and as which encoding.
bool FindEncoding(unsigned identifier, Encoding& encoding)
{
    switch (identifier) {
    case kWindows1252Identifier:
        encoding = Encoding::kWindows1252;
        return true;
    case kLatin1Identifier:
        encoding = Encoding::kLatin1;
        return true;
    case kUtf8Identifier:
        encoding = Encoding::kUtf8;
        return true;
    default:
        return false;
    }
}

/// Windows-1252 from 0x80 to 0x9F. The five bytes without a character stand for the control
/// character of the same number, so that every byte of a file comes back.
constexpr std::array<char16_t, 32> kHigh1252 = {
    0x20AC, 0x0081, 0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021, 0x02C6, 0x2030, 0x0160,
    0x2039, 0x0152, 0x008D, 0x017D, 0x008F, 0x0090, 0x2018, 0x2019, 0x201C, 0x201D, 0x2022,
    0x2013, 0x2014, 0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0x009D, 0x017E, 0x0178};

/// The number of the character; a wide character may be signed.
std::uint32_t Number(wchar_t c)
{
    return static_cast<std::uint32_t>(static_cast<std::make_unsigned_t<wchar_t>>(c));
}

/// As many characters as are looked at together: most text is ASCII and goes through in pieces.
constexpr std::size_t kPiece = 16;

/// Widens ASCII from the start of `bytes` and returns how many bytes that were.
std::size_t WidenAscii(std::string_view bytes, wchar_t* to)
{
    std::size_t done = 0;
    while (bytes.size() - done >= kPiece) {
        std::array<std::uint64_t, 2> words;
        std::memcpy(words.data(), bytes.data() + done, kPiece);
        if (((words[0] | words[1]) & 0x8080808080808080U) != 0)
            break;
        for (std::size_t i = 0; i < kPiece; ++i)
            to[done + i] = static_cast<wchar_t>(static_cast<unsigned char>(bytes[done + i]));
        done += kPiece;
    }
    while (done < bytes.size() && static_cast<unsigned char>(bytes[done]) < 0x80) {
        to[done] = static_cast<wchar_t>(bytes[done]);
        ++done;
    }
    return done;
}

/// Narrows ASCII from the start of `text` and returns how many characters that were.
std::size_t NarrowAscii(std::wstring_view text, char* to)
{
    std::size_t done = 0;
    while (text.size() - done >= kPiece) {
        std::uint32_t all = 0;
        for (std::size_t i = 0; i < kPiece; ++i)
            all |= Number(text[done + i]);
        if (all >= 0x80)
            break;
        for (std::size_t i = 0; i < kPiece; ++i)
            to[done + i] = static_cast<char>(text[done + i]);
        done += kPiece;
    }
    while (done < text.size() && Number(text[done]) < 0x80) {
        to[done] = static_cast<char>(text[done]);
        ++done;
    }
    return done;
}

/// One character at the start of `bytes` (not empty), its bytes taken off. A byte that begins no
/// whole character is taken alone, a cut one as far as it goes.
std::uint32_t TakeUtf8(std::string_view& bytes)
{
    const auto byte = [&](std::size_t i) { return static_cast<unsigned char>(bytes[i]); };
    const unsigned lead = byte(0);
    const std::size_t length = lead < 0x80    ? 1
                               : lead < 0xC2  ? 0
                               : lead < 0xE0  ? 2
                               : lead < 0xF0  ? 3
                               : lead <= 0xF4 ? 4
                                              : 0;
    std::uint32_t c = length < 2 ? lead : lead & (0x7FU >> length);
    std::size_t taken = 1;
    while (taken < length && taken < bytes.size()) {
        const unsigned next = byte(taken);
        // Neither overlong forms nor surrogates nor numbers above U+10FFFF.
        const unsigned low = taken > 1      ? 0x80U
                             : lead == 0xE0 ? 0xA0U
                             : lead == 0xF0 ? 0x90U
                                            : 0x80U;
        const unsigned high = taken > 1      ? 0xBFU
                              : lead == 0xED ? 0x9FU
                              : lead == 0xF4 ? 0x8FU
                                             : 0xBFU;
        if (next < low || next > high)
            break;
        c = (c << 6) | (next & 0x3FU);
        ++taken;
    }
    bytes.remove_prefix(taken);
    return length != 0 && taken == length ? c : kReplacement;
}

wchar_t* PutWide(std::uint32_t c, wchar_t* to)
{
    if constexpr (sizeof(wchar_t) == 2) {
        if (c >= 0x10000) {
            *to++ = static_cast<wchar_t>(0xD7C0 + (c >> 10));
            *to++ = static_cast<wchar_t>(0xDC00 + (c & 0x3FF));
            return to;
        }
    }
    *to++ = static_cast<wchar_t>(c);
    return to;
}

/// One character at the start of `text` (not empty), taken off; a surrogate without its other half
/// and a number that is no character are U+FFFD.
std::uint32_t TakeWide(std::wstring_view& text)
{
    const std::uint32_t c = Number(text[0]);
    text.remove_prefix(1);
    if (c < 0xD800 || (c > 0xDFFF && c <= 0x10FFFF))
        return c;
    if (sizeof(wchar_t) == 2 && c < 0xDC00 && !text.empty()) {
        const std::uint32_t low = Number(text[0]);
        if (low >= 0xDC00 && low <= 0xDFFF) {
            text.remove_prefix(1);
            return ((c - 0xD7C0) << 10) | (low - 0xDC00);
        }
    }
    return kReplacement;
}

char* PutUtf8(std::uint32_t c, char* to)
{
    const auto put = [&to](std::uint32_t byte) { *to++ = static_cast<char>(byte); };
    if (c < 0x80) {
        put(c);
    } else if (c < 0x800) {
        put(0xC0 | (c >> 6));
        put(0x80 | (c & 0x3F));
    } else if (c < 0x10000) {
        put(0xE0 | (c >> 12));
        put(0x80 | ((c >> 6) & 0x3F));
        put(0x80 | (c & 0x3F));
    } else {
        put(0xF0 | (c >> 18));
        put(0x80 | ((c >> 12) & 0x3F));
        put(0x80 | ((c >> 6) & 0x3F));
        put(0x80 | (c & 0x3F));
    }
    return to;
}

/// One byte for each character; `?` for one that the encoding lacks.
char ToSingleByte(std::uint32_t c, Encoding encoding)
{
    if (c < 0x80 || (c >= 0xA0 && c <= 0xFF) || (encoding == Encoding::kLatin1 && c <= 0xFF))
        return static_cast<char>(c);
    if (encoding == Encoding::kWindows1252) {
        const auto* const at = std::find(kHigh1252.begin(), kHigh1252.end(), c);
        if (at != kHigh1252.end())
            return static_cast<char>(0x80 + (at - kHigh1252.begin()));
    }
    return '?';
}

std::string NarrowBuiltIn(std::wstring_view text, Encoding encoding)
{
    const bool utf8 = encoding == Encoding::kUtf8;
    // At most four bytes a character in UTF-8: three where a wide character has 16 bits, as two of
    // them make one of four bytes.
    const std::size_t most = utf8 ? (sizeof(wchar_t) == 2 ? 3 : 4) : 1;
    std::string bytes;
    // ASCII fits in one byte a character; room for the rest is made when there is any.
    bytes.resize(text.size());
    std::size_t size = NarrowAscii(text, bytes.data());
    text.remove_prefix(size);
    if (most > 1 && !text.empty())
        bytes.resize(size + text.size() * most);
    while (!text.empty()) {
        const std::uint32_t c = TakeWide(text);
        char* const to = bytes.data() + size;
        if (utf8)
            size = static_cast<std::size_t>(PutUtf8(c, to) - bytes.data());
        else {
            *to = ToSingleByte(c, encoding);
            ++size;
        }
        const std::size_t ascii = NarrowAscii(text, bytes.data() + size);
        text.remove_prefix(ascii);
        size += ascii;
    }
    bytes.resize(size);
    return bytes;
}

} // namespace

bool SetThreadCodePage(unsigned identifier)
{
    Encoding encoding{};
    if (!FindEncoding(identifier, encoding) && !system::KnowsCodePage(identifier))
        return false;
    chosenCodePage = identifier;
    return true;
}

FileText FileTextFromThreadCodePage(std::unique_ptr<char[]> bytes, std::size_t size)
{
    const unsigned codePage = ThreadCodePage();
    FileText text{std::move(bytes), size, Encoding::kUtf8};
    if (FindEncoding(codePage, text.encoding))
        return text;
    const std::string utf8 = system::CodePageToUtf8(codePage, text.View());
    text.bytes = std::make_unique_for_overwrite<char[]>(utf8.size());
    text.size = utf8.size();
    std::memcpy(text.bytes.get(), utf8.data(), utf8.size());
    return text;
}

void AppendWide(CString& text, std::string_view bytes, Encoding encoding)
{
    // No byte of any encoding gives more than one wide character.
    wchar_t* to = text.Extend(bytes.size());
    for (;;) {
        const std::size_t ascii = WidenAscii(bytes, to);
        bytes.remove_prefix(ascii);
        to += ascii;
        if (bytes.empty())
            break;
        if (encoding == Encoding::kUtf8) {
            to = PutWide(TakeUtf8(bytes), to);
            continue;
        }
        const auto byte = static_cast<unsigned char>(bytes[0]);
        bytes.remove_prefix(1);
        const bool mapped = encoding == Encoding::kWindows1252 && byte < 0xA0;
        *to++ = static_cast<wchar_t>(mapped ? kHigh1252[byte - 0x80U] : byte);
    }
    text.EndExtend(to);
}

CString Widen(std::string_view bytes)
{
    const unsigned codePage = ThreadCodePage();
    Encoding encoding = Encoding::kUtf8;
    CString text;
    if (FindEncoding(codePage, encoding))
        AppendWide(text, bytes, encoding);
    else
        AppendWide(text, system::CodePageToUtf8(codePage, bytes), Encoding::kUtf8);
    return text;
}

std::string Narrow(std::wstring_view text)
{
    const unsigned codePage = ThreadCodePage();
    Encoding encoding{};
    if (FindEncoding(codePage, encoding))
        return NarrowBuiltIn(text, encoding);
    return system::WideToCodePage(codePage, text);
}

std::string ToUtf8(std::wstring_view text)
{
    return NarrowBuiltIn(text, Encoding::kUtf8);
}

CString FromUtf8(std::string_view text)
{
    CString wide;
    AppendWide(wide, text, Encoding::kUtf8);
    return wide;
}

} // namespace dcm
