#pragma once

#include "dcm/platform/cfile.h"
#include "dcm/platform/cstring.h"
#include "dcm/platform/encoding.h"

#include <algorithm>
#include <cstddef>
#include <memory>
#include <string>
#include <string_view>

namespace dcm {

/// A text that is composed piece by piece, as the bytes that it has in its file.
class FileTextBuilder
{
public:
    /// A text for a file: in the thread's code page if that is built in, otherwise in UTF-8. A
    /// character that the encoding lacks, and a zero, become `?`; each line ends in CR LF.
    static FileTextBuilder ForFile();
    /// A text for the host: it keeps all characters, and its lines end in line feeds.
    static FileTextBuilder ForHost() { return {Encoding::kLenientUtf8, false}; }

    /// Makes the text empty, or shortens it to `size` bytes, and keeps its memory.
    void Clear() { m_size = 0; }
    void Truncate(std::size_t size) { m_size = size; }
    std::size_t Size() const { return m_size; }

    /// Appends a text. In a text for a file, a line feed in it ends a line, with or without a
    /// carriage return before it; in a text for the host, it is kept.
    FileTextBuilder& Append(std::wstring_view text);
    /// Appends ASCII without line ends and zeros, such as a mark or a digit.
    FileTextBuilder& AppendAscii(std::string_view ascii)
    {
        EndExtend(std::copy(ascii.begin(), ascii.end(), Extend(ascii.size())));
        return *this;
    }
    /// Ends a line.
    FileTextBuilder& EndLine();
    /// Makes room for `room` bytes, in the text's encoding, after the text and returns their place.
    /// The text grows only when `EndExtend` is called with the end of what was written there.
    char* Extend(std::size_t room)
    {
        if (room > m_capacity - m_size)
            MakeRoom(room);
        return m_bytes.get() + m_size;
    }
    void EndExtend(const char* end) { m_size = static_cast<std::size_t>(end - m_bytes.get()); }

    /// The bytes, valid until the text grows.
    std::string_view Bytes() const { return {m_bytes.get(), m_size}; }
    /// The bytes of a text for a file in the thread's code page: `Bytes()`, or what they are
    /// converted to, which is stored in `converted`. It must be called by the thread that made this
    /// object, with the same code page.
    std::string_view BytesOfFile(std::string& converted) const;
    /// The wide form of the text.
    CString Wide() const { return Decode(Bytes(), m_encoding); }

private:
    FileTextBuilder(Encoding encoding, bool forFile) : m_encoding(encoding), m_forFile(forFile) {}
    void MakeRoom(std::size_t room);

    std::unique_ptr<char[]> m_bytes;
    std::size_t m_size = 0;
    std::size_t m_capacity = 0;
    Encoding m_encoding;
    bool m_forFile;
};

/// Writes a text for a file, composed by this thread, in one piece. Throws `CFileException` when
/// not all of it could be written.
void WriteText(const FileTextBuilder& text, CFile& file);

} // namespace dcm
