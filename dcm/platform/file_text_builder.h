#pragma once

#include "dcm/platform/codepage.h"
#include "dcm/platform/cstring.h"

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>

namespace dcm {

/// A text for a file that is composed piece by piece, as the bytes that it has there. Its larger
/// members stand in codepage.cpp, beside the encodings.
class FileTextBuilder
{
public:
    /// A text for a file: in the thread's code page where that can be cut, in UTF-8 otherwise. A
    /// character that the encoding lacks becomes `?`, and each line ends in CR LF.
    static FileTextBuilder ForFile();
    /// A text for the host: it keeps all characters, and the ends of its lines are line feeds.
    static FileTextBuilder ForHost() { return {Encoding::kWide, false}; }

    /// Makes the text empty and keeps its memory.
    void Clear() { m_size = 0; }
    std::size_t Size() const { return m_size; }

    /// Adds a text. In a text for a file, a line feed in it ends a line, with or without a carriage
    /// return in front; the host's stays as it is.
    FileTextBuilder& Append(std::wstring_view text);
    /// Ends a line.
    FileTextBuilder& EndLine();
    /// Makes room for `room` bytes, in the text's encoding, behind the text and returns where they
    /// go; the text is only longer once `EndExtend` has been told where they end.
    char* Extend(std::size_t room)
    {
        if (room > m_capacity - m_size)
            MakeRoom(room);
        return m_bytes.get() + m_size;
    }
    void EndExtend(const char* end) { m_size = static_cast<std::size_t>(end - m_bytes.get()); }

    /// The bytes, valid until the text grows.
    std::string_view Bytes() const { return {m_bytes.get(), m_size}; }
    CString Wide() const;

private:
    FileTextBuilder(Encoding encoding, bool crLf) : m_encoding(encoding), m_crLf(crLf) {}
    void MakeRoom(std::size_t room);

    std::unique_ptr<char[]> m_bytes;
    std::size_t m_size = 0;
    std::size_t m_capacity = 0;
    Encoding m_encoding;
    bool m_crLf;
};

/// The bytes of a text for a file in the thread's code page: `bytes` themselves where that can be
/// cut, else what they become, held in `converted`.
std::string_view ToThreadCodePage(std::string_view bytes, std::string& converted);

} // namespace dcm
