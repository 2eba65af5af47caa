#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/cstring.h"

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

/// @file
/// Characters of files: the thread's code page and conversion from and to it.

namespace dcm {

/// Chooses the ANSI code page of the calling thread by its Windows identifier: 1252 (where a
/// thread starts on Linux), 28591 for ISO-8859-1, 65001 for UTF-8, or any other that the system
/// can convert. Returns false, and changes nothing, when the identifier is unknown.
DCM_API bool SetThreadCodePage(unsigned identifier);

/// Encodings in which a text can be cut at a line feed or a zero byte before it is widened: these
/// bytes stand for themselves and are part of no other character.
enum class Encoding : unsigned char
{
    kWindows1252,
    kLatin1,
    kUtf8,
};

/// The bytes of a text file in an encoding that can be cut.
struct FileText
{
    /// `size` bytes in `encoding`, owned.
    std::unique_ptr<char[]> bytes;
    std::size_t size = 0;
    Encoding encoding = Encoding::kWindows1252;

    /// The bytes, valid as long as they are owned here.
    std::string_view View() const { return {bytes.get(), size}; }
};

/// Takes the bytes of a file in the thread's code page. They stay as they are where that page can
/// be cut; text of any other page is converted to UTF-8 whole.
FileText FileTextFromThreadCodePage(std::unique_ptr<char[]> bytes, std::size_t size);

/// Appends the wide form of `bytes`. Bytes that are no character in UTF-8 become U+FFFD.
void AppendWide(CString& text, std::string_view bytes, Encoding encoding);

/// The wide form of `bytes` in the thread's code page.
CString Widen(std::string_view bytes);

/// Composes text in the thread's code page, piece by piece; a character that the page lacks becomes
/// `?`.
class TextEncoder
{
public:
    /// Makes room for `most` characters, which is as many as may be appended.
    explicit TextEncoder(std::size_t most);

    /// Adds a text at the end.
    void Append(std::wstring_view text);
    /// The bytes of all that was appended; valid as long as the encoder is left alone.
    std::string_view Finish();

private:
    unsigned m_codePage;
    /// None for a page that only the system converts.
    std::optional<Encoding> m_encoding;
    std::unique_ptr<char[]> m_bytes;
    std::size_t m_size = 0;
    /// What is appended in such a page; the system converts it as a whole.
    CString m_wide;
    std::string m_converted;
};

/// `text` in UTF-8, and the wide form of a text in UTF-8; what is no character becomes U+FFFD.
DCM_API std::string ToUtf8(std::wstring_view text);
DCM_API CString FromUtf8(std::string_view text);

} // namespace dcm
