#include "dcm/platform/encoding.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cstdint>
#include <cstring>
#include <type_traits>

namespace dcm {

namespace {

constexpr std::uint32_t kReplacement = 0xFFFD;

/// Windows-1252 from 0x80 to 0x9F. The five unassigned bytes are the control characters of the same
/// numbers, so that every byte of a file comes back.
constexpr std::array<char16_t, 32> kHigh1252 = {
    0x20AC, 0x0081, 0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021, 0x02C6, 0x2030, 0x0160,
    0x2039, 0x0152, 0x008D, 0x017D, 0x008F, 0x0090, 0x2018, 0x2019, 0x201C, 0x201D, 0x2022,
    0x2013, 0x2014, 0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0x009D, 0x017E, 0x0178};

/// The number of the character; a wide character may be signed.
std::uint32_t Number(wchar_t c)
{
    return static_cast<std::uint32_t>(static_cast<std::make_unsigned_t<wchar_t>>(c));
}

/// How many characters are converted together: most text is ASCII and is converted in runs, by
/// loops that compilers vectorize.
constexpr std::size_t kPiece = 32;

using Words = std::array<std::uint64_t, kPiece / sizeof(std::uint64_t)>;

Words LoadPiece(const char* bytes)
{
    Words words;
    std::memcpy(words.data(), bytes, kPiece);
    return words;
}

/// Whether any byte is above 0x7F.
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

/// Whether any byte is from 0x80 to 0x9F: of its upper three bits, only the first is set. The
/// shifts move the other two bits to the position of the first.
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

/// How many characters of ASCII other than zero `text` begins with.
std::size_t AsciiLength(std::wstring_view text)
{
    std::size_t length = 0;
    while (text.size() - length >= kPiece) {
        const wchar_t* const piece = text.data() + length;
        std::uint32_t all = 0;
        for (std::size_t i = 0; i < kPiece; ++i)
            all |= Number(piece[i]) | (Number(piece[i]) - 1);
        if (all >= 0x80)
            break;
        length += kPiece;
    }
    while (length < text.size() && Number(text[length]) - 1 < 0x7F)
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

/// Replaces the wide characters of the bytes from 0x80 to 0x9F, which were widened to their own
/// numbers, by those of Windows-1252.
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
    /// The range of the second byte, which excludes overlong forms, surrogates and numbers above
    /// U+10FFFF.
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

/// Takes one character off the start of `bytes`, which must not be empty. A byte that begins no
/// character is taken alone, the bytes of an incomplete character are taken together.
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

/// The same for bytes that `Encode` wrote as lenient UTF-8, or a part of them.
std::uint32_t TakeLenientUtf8(std::string_view& bytes)
{
    const auto lead = static_cast<unsigned char>(bytes[0]);
    if (lead < 0x80) {
        bytes.remove_prefix(1);
        return lead;
    }
    const auto ones = static_cast<std::size_t>(std::countl_one(lead));
    const std::size_t length = std::min(ones, bytes.size());
    std::uint32_t c = lead & (0x7FU >> ones);
    for (std::size_t i = 1; i < length; ++i)
        c = (c << 6) | (static_cast<unsigned char>(bytes[i]) & 0x3FU);
    bytes.remove_prefix(length);
    return c;
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

/// Decodes UTF-8 at `to`; `take` takes one character that is not ASCII.
template <class Take>
wchar_t* DecodeUtf8(std::string_view bytes, wchar_t* to, Take take)
{
    for (;;) {
        const std::size_t ascii = AsciiLength(bytes);
        to = CopyNumbers(bytes.data(), ascii, to);
        bytes.remove_prefix(ascii);
        if (bytes.empty())
            return to;
        to = take(bytes, to);
    }
}

/// The same as `TakeCharacter`, but a surrogate without its other half, and a number that is no
/// character, are U+FFFD.
std::uint32_t TakeWide(std::wstring_view& text)
{
    const std::uint32_t c = TakeCharacter(text);
    return c < 0xD800 || (c > 0xDFFF && c <= 0x10FFFF) ? c : kReplacement;
}

/// Writes `c` in UTF-8, continued to numbers of 32 bits: a first byte with `n` leading ones is
/// followed by `n` - 1 bytes of six bits each.
char* PutUtf8(std::uint32_t c, char* to)
{
    if (c < 0x80) {
        *to++ = static_cast<char>(c);
        return to;
    }
    // With `more` bytes after it, the first byte has room for 6 - `more` bits.
    unsigned more = 1;
    while (more < 6 && c >> (5 * more + 6) != 0)
        ++more;
    const std::uint64_t number = c;
    const unsigned mark = 0xFFU & ~(0x7FU >> more);
    *to++ = static_cast<char>(mark | number >> (6 * more));
    for (; more > 0; --more)
        *to++ = static_cast<char>(0x80 | (number >> (6 * (more - 1)) & 0x3F));
    return to;
}

/// One byte for each character; `?` for a zero and for one that the encoding lacks.
char ToSingleByte(std::uint32_t c, Encoding encoding)
{
    if (c == 0)
        return '?';
    if (c < 0x80 || (c >= 0xA0 && c <= 0xFF) || (encoding == Encoding::kLatin1 && c <= 0xFF))
        return static_cast<char>(c);
    if (encoding == Encoding::kWindows1252) {
        const auto* const at = std::find(kHigh1252.begin(), kHigh1252.end(), c);
        if (at != kHigh1252.end())
            return static_cast<char>(0x80 + (at - kHigh1252.begin()));
    }
    return '?';
}

/// Encodes `text` at `to`, where `put` takes one character off it: a zero or one that is not ASCII.
template <class Put>
char* EncodeRuns(std::wstring_view text, char* to, Put put)
{
    for (;;) {
        const std::size_t ascii = AsciiLength(text);
        to = CopyNumbers(text.data(), ascii, to);
        text.remove_prefix(ascii);
        if (text.empty())
            return to;
        to = put(text, to);
    }
}

char* PutLenientUtf8(std::uint32_t c, char* to)
{
    if (c != 0)
        return PutUtf8(c, to);
    *to++ = static_cast<char>(0xC0);
    *to++ = static_cast<char>(0x80);
    return to;
}

} // namespace

std::uint32_t TakeCharacter(std::wstring_view& text)
{
    const std::uint32_t c = Number(text[0]);
    text.remove_prefix(1);
    if (sizeof(wchar_t) == 2 && c >= 0xD800 && c < 0xDC00 && !text.empty()) {
        const std::uint32_t low = Number(text[0]);
        if (low >= 0xDC00 && low <= 0xDFFF) {
            text.remove_prefix(1);
            return ((c - 0xD7C0) << 10) | (low - 0xDC00);
        }
    }
    return c;
}

char* Encode(std::wstring_view text, Encoding encoding, char* to)
{
    if (encoding == Encoding::kLenientUtf8) {
        return EncodeRuns(text, to, [](std::wstring_view& rest, char* at) {
            const std::uint32_t c = Number(rest[0]);
            rest.remove_prefix(1);
            return PutLenientUtf8(c, at);
        });
    }
    return EncodeRuns(text, to, [encoding](std::wstring_view& rest, char* at) {
        const std::uint32_t c = TakeWide(rest);
        if (encoding == Encoding::kUtf8 && c != 0)
            return PutUtf8(c, at);
        *at++ = ToSingleByte(c, encoding);
        return at;
    });
}

void AppendDecoded(CString& text, std::string_view bytes, Encoding encoding)
{
    if (bytes.empty())
        return;
    // In no encoding does a byte give more than one wide character.
    wchar_t* const to = text.Extend(bytes.size());
    if (encoding == Encoding::kUtf8) {
        return text.EndExtend(DecodeUtf8(bytes, to, [](std::string_view& rest, wchar_t* at) {
            return PutWide(TakeUtf8(rest), at);
        }));
    }
    if (encoding == Encoding::kLenientUtf8) {
        return text.EndExtend(DecodeUtf8(bytes, to, [](std::string_view& rest, wchar_t* at) {
            *at++ = static_cast<wchar_t>(TakeLenientUtf8(rest));
            return at;
        }));
    }
    // The numbers of ISO-8859-1 are those of Unicode.
    text.EndExtend(CopyNumbers(bytes.data(), bytes.size(), to));
    if (encoding == Encoding::kWindows1252)
        Replace1252(bytes, to);
}

CString Decode(std::string_view bytes, Encoding encoding)
{
    CString text;
    AppendDecoded(text, bytes, encoding);
    return text;
}

std::string_view WithoutFirstCharacter(std::string_view bytes, Encoding encoding)
{
    if (encoding == Encoding::kUtf8) {
        TakeUtf8(bytes);
    } else if (encoding == Encoding::kLenientUtf8) {
        TakeLenientUtf8(bytes);
    } else {
        bytes.remove_prefix(1);
    }
    return bytes;
}

Utf8Look LookAsUtf8(std::string_view bytes)
{
    constexpr std::string_view replacement = "\xEF\xBF\xBD";
    Utf8Look look;
    for (std::string_view rest = bytes;;) {
        rest.remove_prefix(AsciiLength(rest));
        if (rest.empty())
            return look;
        const std::size_t at = bytes.size() - rest.size();
        if (TakeUtf8(rest) == kReplacement && !bytes.substr(at).starts_with(replacement)) {
            look.firstBad = at;
            return look;
        }
        look.firstWide = std::min(look.firstWide, at);
    }
}

} // namespace dcm
