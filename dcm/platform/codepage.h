#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/cstring.h"

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>

/// @file
/// Characters of files: the thread's code page and conversion from and to it.

namespace dcm {

/// Chooses the ANSI code page of the calling thread by its Windows identifier: 1252 (where a
/// thread starts on Linux), 28591 for ISO-8859-1, 65001 for UTF-8, or any other that the system
/// can convert. Returns false, and changes nothing, when the identifier is unknown.
DCM_API bool SetThreadCodePage(unsigned identifier);

// The library's own, not exported.
/// @cond

/// Encodings in which a text can be cut at any character of ASCII before it is widened: its bytes
/// stand for themselves and are part of no other character. No other character may be taken for one
/// byte.
enum class Encoding : unsigned char
{
    kWindows1252,
    kLatin1,
    kUtf8,
    /// Each wide character outside of ASCII as a fixed number of bytes: for text of the host, which
    /// need not be Unicode.
    kWide,
};

/// A piece of text in such an encoding, owned by somebody else.
struct FileTextView
{
    std::string_view bytes;
    Encoding encoding;

    /// Its wide form. Bytes that are no character in UTF-8 become U+FFFD.
    CString Wide() const;
    /// Drops the first character; the text is not empty.
    void DropFirst();
};

/// The bytes of a text file, in an encoding that can be cut.
struct FileText
{
    /// `size` bytes in `encoding`, owned.
    std::unique_ptr<char[]> bytes;
    std::size_t size = 0;
    Encoding encoding = Encoding::kWindows1252;

    /// The bytes, valid as long as they are owned here.
    std::string_view Bytes() const { return {bytes.get(), size}; }
    FileTextView View() const { return {Bytes(), encoding}; }
};

/// Takes the bytes of a file in the thread's code page. They stay as they are where that page can
/// be cut; text of any other page is converted to UTF-8 whole.
FileText FileTextFromThreadCodePage(std::unique_ptr<char[]> bytes, std::size_t size);

/// Appends the wide form.
void AppendWide(CString& text, FileTextView view);

/// The wide form of `bytes` in the thread's code page.
CString Widen(std::string_view bytes);

/// `text` to be read like that of a file: all its characters, in the encoding kWide.
FileText FileTextOfHost(std::wstring_view text);

/// `text` for a file: in the thread's code page where that can be cut, in UTF-8 otherwise. A
/// character that the encoding lacks becomes `?`.
FileText FileTextFromWide(std::wstring_view text);

/// The bytes for the file: those of `text`, or what UTF-8 becomes in a code page that cannot be
/// cut.
FileText ToThreadCodePage(FileText text);

/// @endcond

/// `text` in UTF-8, and the wide form of a text in UTF-8; what is no character becomes U+FFFD.
DCM_API std::string ToUtf8(std::wstring_view text);
DCM_API CString FromUtf8(std::string_view text);

} // namespace dcm
