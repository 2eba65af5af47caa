#include "dcm/platform/codepage.h"

#include "dcm/platform/code_page_system.h"
#include "dcm/platform/file_text_builder.h"
#include "dcm/platform/text.h"
#include "dcm/platform/word.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstring>
#include <optional>
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

/// As many characters as are looked at together: most text is ASCII and goes through in runs, in
/// loops that compilers turn into vector code.
constexpr std::size_t kPiece = 32;

using Words = std::array<std::uint64_t, kPiece / sizeof(std::uint64_t)>;

Words LoadPiece(const char* bytes)
{
    Words words;
    std::memcpy(words.data(), bytes, kPiece);
    return words;
}

/// Whether any byte lies above 0x7F.
bool HasHigh(const Words& words)
{
    return ((words[0] | words[1] | words[2] | words[3]) & 0x8080808080808080U) != 0;
}

bool HasHigh(std::string_view bytes)
{
    unsigned all = 0;
    std::uint64_t words = 0;
    for (; bytes.size() >= sizeof words; bytes.remove_prefix(sizeof words)) {
        std::uint64_t word = 0;
        std::memcpy(&word, bytes.data(), sizeof word);
        words |= word;
    }
    for (const char c : bytes)
        all |= static_cast<unsigned char>(c);
    return ((words | all) & 0x8080808080808080U) != 0;
}

/// Whether any byte lies from 0x80 to 0x9F: of its upper three bits, only the first is set. The
/// shifts bring the other two to its place.
bool HasC1(const Words& words)
{
    std::uint64_t found = 0;
    for (const std::uint64_t word : words)
        found |= word & ~(word << 1) & ~(word << 2);
    return (found & 0x8080808080808080U) != 0;
}

/// How many bytes of ASCII `bytes` begins with.
std::size_t AsciiLength(std::string_view bytes)
{
    std::size_t length = 0;
    while (bytes.size() - length >= kPiece && !HasHigh(LoadPiece(bytes.data() + length)))
        length += kPiece;
    while (length < bytes.size() && static_cast<unsigned char>(bytes[length]) < 0x80)
        ++length;
    return length;
}

/// How many characters of ASCII `text` begins with.
std::size_t AsciiLength(std::wstring_view text)
{
    std::size_t length = 0;
    while (text.size() - length >= kPiece) {
        const wchar_t* const piece = text.data() + length;
        std::uint32_t all = 0;
        for (std::size_t i = 0; i < kPiece; ++i)
            all |= Number(piece[i]);
        if (all >= 0x80)
            break;
        length += kPiece;
    }
    while (length < text.size() && Number(text[length]) < 0x80)
        ++length;
    return length;
}

/// Copies `count` characters whose numbers are the same in both widths.
template <class From, class To>
To* CopyNumbers(const From* from, std::size_t count, To* to)
{
    for (std::size_t i = 0; i < count; ++i)
        to[i] = static_cast<To>(static_cast<std::make_unsigned_t<From>>(from[i]));
    return to + count;
}

/// Gives the bytes from 0x80 to 0x9F, which have been widened to their own numbers, the characters
/// that they stand for in Windows-1252.
void Replace1252(std::string_view bytes, wchar_t* wide)
{
    const auto replace = [&](std::size_t begin, std::size_t end) {
        for (std::size_t i = begin; i < end; ++i) {
            const auto byte = static_cast<unsigned char>(bytes[i]);
            if (byte >= 0x80 && byte < 0xA0)
                wide[i] = static_cast<wchar_t>(kHigh1252[byte - 0x80U]);
        }
    };
    if (bytes.size() < kPiece) {
        if (HasHigh(bytes))
            replace(0, bytes.size());
        return;
    }
    const auto replacePiece = [&](std::size_t begin) {
        const Words words = LoadPiece(bytes.data() + begin);
        if (HasHigh(words) && HasC1(words))
            replace(begin, begin + kPiece);
    };
    const std::size_t last = bytes.size() - kPiece;
    for (std::size_t begin = 0; begin < last; begin += kPiece)
        replacePiece(begin);
    replacePiece(last);
}

/// What may follow the first byte of a character in UTF-8.
struct Utf8Lead
{
    /// Bytes of the character; 0 for a byte that begins none.
    std::size_t length;
    /// The second byte lies from `low` to `high`: neither overlong forms nor surrogates nor numbers
    /// above U+10FFFF.
    unsigned low = 0x80;
    unsigned high = 0xBF;
};

Utf8Lead LeadOf(unsigned byte)
{
    if (byte < 0x80)
        return {1};
    if (byte < 0xC2 || byte > 0xF4)
        return {0};
    if (byte < 0xE0)
        return {2};
    if (byte < 0xF0)
        return {3, byte == 0xE0 ? 0xA0U : 0x80U, byte == 0xED ? 0x9FU : 0xBFU};
    return {4, byte == 0xF0 ? 0x90U : 0x80U, byte == 0xF4 ? 0x8FU : 0xBFU};
}

/// One character at the start of `bytes` (not empty), its bytes taken off. A byte that begins no
/// whole character is taken alone, a cut one as far as it goes.
std::uint32_t TakeUtf8(std::string_view& bytes)
{
    const auto byte = [&](std::size_t i) { return static_cast<unsigned char>(bytes[i]); };
    Utf8Lead lead = LeadOf(byte(0));
    std::uint32_t c = lead.length < 2 ? byte(0) : byte(0) & (0x7FU >> lead.length);
    std::size_t taken = 1;
    for (; taken < lead.length && taken < bytes.size(); ++taken) {
        if (byte(taken) < lead.low || byte(taken) > lead.high)
            break;
        c = (c << 6) | (byte(taken) & 0x3FU);
        lead.low = 0x80;
        lead.high = 0xBF;
    }
    bytes.remove_prefix(taken);
    return taken == lead.length ? c : kReplacement;
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

wchar_t* WidenUtf8(std::string_view bytes, wchar_t* to)
{
    for (;;) {
        const std::size_t ascii = AsciiLength(bytes);
        to = CopyNumbers(bytes.data(), ascii, to);
        bytes.remove_prefix(ascii);
        if (bytes.empty())
            return to;
        to = PutWide(TakeUtf8(bytes), to);
    }
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

/// The bytes of a character in the encoding kWide: six bits of its number in each, from low to
/// high, and the highest bit.
constexpr std::size_t kBytesOfWide = sizeof(wchar_t) == 2 ? 3 : 6;

char* PutAsWide(std::uint32_t c, char* to)
{
    for (std::size_t i = 0; i < kBytesOfWide; ++i, c >>= 6)
        *to++ = static_cast<char>(0x80 | (c & 0x3F));
    return to;
}

/// The most bytes that a wide character takes. Two of 16 bits make a character of four bytes.
std::size_t MostBytes(Encoding encoding)
{
    if (encoding == Encoding::kWide)
        return kBytesOfWide;
    if (encoding != Encoding::kUtf8)
        return 1;
    return sizeof(wchar_t) == 2 ? 3 : 4;
}

/// Narrows all of `text` to where there is room for it and returns the end.
char* NarrowTo(char* to, std::wstring_view text, Encoding encoding)
{
    for (;;) {
        const std::size_t ascii = AsciiLength(text);
        to = CopyNumbers(text.data(), ascii, to);
        text.remove_prefix(ascii);
        if (text.empty())
            return to;
        if (encoding == Encoding::kWide) {
            to = PutAsWide(Number(text[0]), to);
            text.remove_prefix(1);
            continue;
        }
        const std::uint32_t c = TakeWide(text);
        if (encoding == Encoding::kUtf8)
            to = PutUtf8(c, to);
        else
            *to++ = ToSingleByte(c, encoding);
    }
}

wchar_t* WidenWide(std::string_view bytes, wchar_t* to)
{
    while (!bytes.empty()) {
        const std::size_t ascii = AsciiLength(bytes);
        to = CopyNumbers(bytes.data(), ascii, to);
        bytes.remove_prefix(ascii);
        const std::size_t size = std::min(bytes.size(), kBytesOfWide);
        std::uint64_t c = 0;
        for (std::size_t i = 0; i < size; ++i)
            c |= std::uint64_t{static_cast<unsigned char>(bytes[i]) & 0x3FU} << (6 * i);
        if (size > 0)
            *to++ = static_cast<wchar_t>(c);
        bytes.remove_prefix(size);
    }
    return to;
}

/// A place for a text, which is not empty, by its length and its first and last eight characters.
std::uint8_t PlaceOf(std::string_view bytes)
{
    const std::size_t size = std::min(bytes.size(), std::size_t{8});
    const std::uint64_t first = LoadWord(bytes.data()) << (64 - 8 * size);
    const std::uint64_t last = LoadWord(bytes.data() + bytes.size() - size) << (64 - 8 * size);
    constexpr std::uint64_t factor = 0x9E37'79B9'7F4A'7C15;
    return static_cast<std::uint8_t>(((first + bytes.size()) * factor ^ last) * factor >> 56);
}

std::string_view BeforeZero(std::string_view bytes)
{
    return bytes.substr(0, bytes.find('\0'));
}

FileText Copy(const std::string& utf8)
{
    FileText text(utf8.size(), Encoding::kUtf8);
    text.EndAt(std::ranges::copy(utf8, text.bytes.get()).out);
    return text;
}

} // namespace

bool SetThreadCodePage(unsigned identifier)
{
    if (!FindEncoding(identifier) && !system::KnowsCodePage(identifier))
        return false;
    chosenCodePage = identifier;
    return true;
}

FileText FileTextFromThreadCodePage(FileText text)
{
    const unsigned codePage = ThreadCodePage();
    const auto encoding = FindEncoding(codePage);
    if (!encoding)
        return Copy(system::CodePageToUtf8(codePage, BeforeZero(text.Bytes())));
    text.encoding = *encoding;
    return text;
}

FileText FileTextOfHost(std::wstring_view text)
{
    FileText result(text.size() * kBytesOfWide, Encoding::kWide);
    result.EndAt(NarrowTo(result.bytes.get(), text, Encoding::kWide));
    return result;
}

FileTextBuilder FileTextBuilder::ForFile()
{
    return {FindEncoding(ThreadCodePage()).value_or(Encoding::kUtf8), true};
}

FileTextBuilder& FileTextBuilder::Append(std::wstring_view text)
{
    // Line feeds are rare, and what is between them is ready as it is.
    for (;;) {
        const std::size_t lineFeed = m_crLf ? text.find(L'\n') : text.npos;
        const std::wstring_view line = text.substr(0, lineFeed);
        char* const to = Extend(line.size() * MostBytes(m_encoding));
        EndExtend(NarrowTo(to, line, m_encoding));
        if (lineFeed == text.npos)
            return *this;
        EndLine();
        text.remove_prefix(lineFeed + 1);
    }
}

FileTextBuilder& FileTextBuilder::EndLine()
{
    char* to = Extend(2);
    if (m_crLf && !Bytes().ends_with('\r'))
        *to++ = '\r';
    *to++ = '\n';
    EndExtend(to);
    return *this;
}

CString FileTextBuilder::Wide() const
{
    CString text;
    AppendWide(text, Bytes(), m_encoding);
    return text;
}

void FileTextBuilder::MakeRoom(std::size_t room)
{
    // Twice as much, so that a text that grows piece by piece is copied a few times only.
    constexpr std::size_t least = 4096;
    const std::size_t capacity = std::max({least, 2 * m_capacity, m_size + room});
    auto bytes = std::make_unique_for_overwrite<char[]>(capacity);
    std::ranges::copy(Bytes(), bytes.get());
    m_bytes = std::move(bytes);
    m_capacity = capacity;
}

std::string_view ToThreadCodePage(std::string_view bytes, std::string& converted)
{
    const unsigned codePage = ThreadCodePage();
    if (FindEncoding(codePage))
        return bytes;
    converted = system::Utf8ToCodePage(codePage, bytes);
    return converted;
}

void AppendWide(CString& text, std::string_view bytes, Encoding encoding)
{
    if (bytes.empty())
        return;
    // No byte of any encoding gives more than one wide character.
    wchar_t* const to = text.Extend(bytes.size());
    if (encoding == Encoding::kUtf8)
        return text.EndExtend(WidenUtf8(bytes, to));
    if (encoding == Encoding::kWide)
        return text.EndExtend(WidenWide(bytes, to));
    // ISO-8859-1 is how Unicode begins.
    text.EndExtend(CopyNumbers(bytes.data(), bytes.size(), to));
    if (encoding == Encoding::kWindows1252)
        Replace1252(bytes, to);
}

void FileTextView::DropFirst()
{
    if (file->encoding == Encoding::kUtf8)
        TakeUtf8(bytes);
    else if (file->encoding == Encoding::kWide && HasHigh(bytes.substr(0, 1)))
        bytes.remove_prefix(std::min(bytes.size(), kBytesOfWide));
    else
        bytes.remove_prefix(1);
}

CString FileTextView::Wide() const
{
    CString text;
    AppendWide(text, bytes, file->encoding);
    return text;
}

CString FileTextView::SharedWide() const
{
    if (file->encoding == Encoding::kWide) // A host hands over one block.
        return Wide();
    if (!file->wideTexts)
        file->wideTexts = std::make_unique<WideTexts>();
    return file->wideTexts->Get(*this);
}

CString WideTexts::Get(FileTextView text)
{
    constexpr std::size_t longest = 64;
    if (text.bytes.empty() || text.bytes.size() > longest)
        return text.Wide();
    Entry& entry = m_entries[PlaceOf(text.bytes)];
    if (entry.bytes != text.bytes) {
        // Only a text that comes a second time is worth to be kept.
        entry = {text.bytes, {}};
        return text.Wide();
    }
    if (entry.wide.IsEmpty())
        entry.wide = text.Wide();
    return entry.wide;
}

CString Widen(std::string_view bytes)
{
    const unsigned codePage = ThreadCodePage();
    CString text;
    if (const auto encoding = FindEncoding(codePage))
        AppendWide(text, bytes, *encoding);
    else
        AppendWide(text, system::CodePageToUtf8(codePage, bytes), Encoding::kUtf8);
    return text;
}

std::string ToUtf8(std::wstring_view text)
{
    std::string bytes(text.size() * MostBytes(Encoding::kUtf8), '\0');
    const char* const end = NarrowTo(bytes.data(), text, Encoding::kUtf8);
    bytes.resize(static_cast<std::size_t>(end - bytes.data()));
    return bytes;
}

CString FromUtf8(std::string_view text)
{
    CString wide;
    AppendWide(wide, text, Encoding::kUtf8);
    return wide;
}

} // namespace dcm
