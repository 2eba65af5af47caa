#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/cstring.h"
#include "dcm/platform/word.h"

#include <array>
#include <cstddef>
#include <cstring>
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
/// stand for themselves and are part of no other character. Only characters of ASCII are sure to be
/// one byte.
enum class Encoding : unsigned char
{
    kWindows1252,
    kLatin1,
    kUtf8,
    /// Each wide character outside of ASCII as a fixed number of bytes: for text of the host, which
    /// need not be Unicode.
    kWide,
};

struct FileText;

/// A piece of the text of a file.
struct FileTextView
{
    std::string_view bytes;
    /// Where it comes from; never null.
    const FileText* file;

    /// Its wide form. Bytes that are no character in UTF-8 become U+FFFD.
    CString Wide() const;
    /// The same for a text that the file is likely to repeat: equal texts share their memory. The
    /// bytes must be the file's own.
    CString SharedWide() const;
    /// Drops the first character; the text is not empty.
    void DropFirst();
};

/// Remembers the last texts that were widened.
class WideTexts
{
public:
    /// The wide form of a text whose file outlives this object.
    CString Get(FileTextView text);

private:
    struct Entry
    {
        std::string_view bytes;
        CString wide;
    };

    std::array<Entry, 256> m_entries;
};

/// The bytes of a text file, in an encoding that can be cut. A zero among them ends what lines are
/// cut from.
struct FileText
{
    /// `size` bytes in `encoding`, owned, and `kReadAhead` zeros behind them.
    std::unique_ptr<char[]> bytes;
    std::size_t size = 0;
    Encoding encoding = Encoding::kWindows1252;

    /// No text, and no memory for one.
    FileText() = default;
    /// Memory for up to `room` bytes, for the owner to fill.
    FileText(std::size_t room, Encoding textEncoding)
        : bytes(std::make_unique_for_overwrite<char[]>(room + kReadAhead)), encoding(textEncoding)
    {}
    /// Ends the text where its owner stopped to fill the memory.
    void EndAt(std::size_t length)
    {
        size = length;
        std::memset(bytes.get() + length, 0, kReadAhead);
    }
    void EndAt(const char* end) { EndAt(static_cast<std::size_t>(end - bytes.get())); }

    /// The bytes, valid as long as they are owned here.
    std::string_view Bytes() const { return {bytes.get(), size}; }
    FileTextView View() const { return {Bytes(), this}; }

    /// Texts of a file repeat each other; made when it is first needed.
    mutable std::unique_ptr<WideTexts> wideTexts;
};

/// The text of a file whose bytes are in the thread's code page, whatever `text` says. They stay as
/// they are where that page can be cut; text of any other page, up to a zero, is converted to
/// UTF-8.
FileText FileTextFromThreadCodePage(FileText text);

/// Appends the wide form of `bytes`.
void AppendWide(CString& text, std::string_view bytes, Encoding encoding);

/// The wide form of `bytes` in the thread's code page.
CString Widen(std::string_view bytes);

/// `text` to be read like that of a file: all its characters, in the encoding kWide.
FileText FileTextOfHost(std::wstring_view text);

class FileTextBuilder;

/// @endcond

/// `text` in UTF-8, and the wide form of a text in UTF-8; what is no character becomes U+FFFD.
DCM_API std::string ToUtf8(std::wstring_view text);
DCM_API CString FromUtf8(std::string_view text);

} // namespace dcm
