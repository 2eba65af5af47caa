#pragma once

#include "dcm/platform/cstring.h"
#include "dcm/platform/encoding.h"
#include "dcm/platform/system_file.h"
#include "dcm/platform/text.h"
#include "dcm/platform/word.h"
#include "dcm/textfile/shared_texts.h"

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>
#include <string_view>
#include <utility>
#include <vector>

/// The text of a file, or of a host, as bytes: its lines and its blocks. The bytes are decoded only
/// where a wide text is kept, since wide text takes four times the memory.
namespace dcm {

/// Bytes with `kReadAhead` zeros after them.
class TextBuffer
{
public:
    /// No bytes, and no memory for them.
    TextBuffer() = default;
    /// Memory for up to `room` bytes. `EndAt` must be called after they are written.
    explicit TextBuffer(std::size_t room)
        : m_bytes(system::TakeMemory(room + kReadAhead), Release{room + kReadAhead})
    {}

    char* Data() { return m_bytes.get(); }
    /// Sets the number of bytes and writes the zeros after them.
    void EndAt(std::size_t size)
    {
        m_size = size;
        std::memset(m_bytes.get() + size, 0, kReadAhead);
    }
    /// The bytes, valid as long as this object or the one that it is moved to.
    std::string_view Bytes() const { return {m_bytes.get(), m_size}; }

private:
    struct Release
    {
        std::size_t size;
        void operator()(char* memory) const noexcept { system::ReleaseMemory(memory, size); }
    };
    std::unique_ptr<char[], Release> m_bytes;
    std::size_t m_size = 0;
};

/// A text in an encoding that can be cut at any ASCII character. Lines end at its first zero byte.
class FileText
{
public:
    /// An empty text.
    FileText() = default;
    /// The content of a file in the thread's code page. Where that page has to be converted by the
    /// system, the text is UTF-8 and ends at the first zero.
    static FileText OfFile(TextBuffer content);
    /// A text of the host. Every character comes back; no byte is zero.
    static FileText OfHost(std::wstring_view text);

    std::string_view Bytes() const { return m_buffer.Bytes(); }
    Encoding EncodingOfBytes() const { return m_encoding; }
    /// What a conversion leaves no trace of.
    struct Origin
    {
        /// Whether the text was converted by the system. The rest is set only then.
        bool converted = false;
        bool textAfterZero = false;
        bool looksLikeUtf8 = false;
    };
    const Origin& OriginOfBytes() const { return m_origin; }

    /// The wide form of a part of the text, or of other bytes in its encoding. Bytes that are no
    /// character in UTF-8 become U+FFFD.
    CString Wide(std::string_view part) const { return Decode(part, m_encoding); }
    void AppendWide(CString& text, std::string_view part) const
    {
        AppendDecoded(text, part, m_encoding);
    }
    /// The wide form of a part of the text that a file is likely to repeat: equal texts share their
    /// memory.
    CString SharedWide(std::string_view part) const
    {
        return m_shared ? m_shared->Get(part, m_encoding) : Wide(part);
    }
    /// `part`, which must not be empty, without its first character.
    std::string_view WithoutFirstCharacter(std::string_view part) const
    {
        return dcm::WithoutFirstCharacter(part, m_encoding);
    }

private:
    FileText(TextBuffer buffer, Encoding encoding)
        : m_buffer(std::move(buffer)), m_encoding(encoding)
    {}

    TextBuffer m_buffer;
    Encoding m_encoding = Encoding::kUtf8;
    Origin m_origin;
    /// None for a text of the host, which is a single block.
    std::unique_ptr<SharedTexts> m_shared;
};

/// Takes the next line, without its line feed, off `rest`, which is the end of a text. Returns
/// false when no line feed follows before the first zero.
inline bool TakeLine(std::string_view& rest, std::string_view& line)
{
    const char* const lineFeed = rest.empty() ? nullptr : std::strchr(rest.data(), '\n');
    if (lineFeed == nullptr)
        return false;
    line = {rest.data(), lineFeed};
    rest.remove_prefix(line.size() + 1);
    return true;
}

/// The first zero or control character up to the carriage return at or after `at`, which must be
/// part of a text or its end.
inline const char* FindControl(const char* at)
{
    constexpr unsigned char limit = '\r' + 1;
    for (;; at += 8) {
        const std::uint64_t word = LoadWord(at);
        // The difference alone sets the bit for these characters and for some that are no ASCII.
        if (((word - RepeatByte(limit)) & RepeatByte(0x80)) == 0)
            continue;
        const std::uint64_t controls = BytesBelow(word, limit);
        if (controls != 0)
            return at + LowestByteSet(controls);
    }
}

/// The same for a line of a file, which ends before its carriage returns.
inline bool TakeFileLine(std::string_view& rest, std::string_view& line)
{
    if (rest.empty())
        return false;
    const char* at = FindControl(rest.data());
    for (;; at = FindControl(at)) {
        const char* const end = at;
        while (*at == '\r')
            ++at;
        if (*at == '\n') {
            line = {rest.data(), end};
            rest = {at + 1, rest.data() + rest.size()};
            return true;
        }
        if (*at == '\0')
            return false;
        ++at;
    }
}

class BlockReport;

/// One block of a text: its lines without their line ends. The text must outlive the block.
class FileBlock
{
public:
    /// Makes this a block without lines, whose first line will be line `number` of `text`, counted
    /// from 1. The memory of the former lines is kept.
    void Begin(const FileText& text, std::int32_t number)
    {
        m_text = &text;
        m_firstNumber = number;
        m_lines.clear();
    }
    /// Adds the next line, which must be a part of the text.
    void AddLine(std::string_view line)
    {
        const auto begin = static_cast<std::uint32_t>(line.data() - m_text->Bytes().data());
        m_lines.push_back({begin, begin + static_cast<std::uint32_t>(line.size())});
    }

    /// Takes the findings of the block's readers; null when nothing is reported.
    BlockReport* Report() const { return m_report; }
    void SetReport(BlockReport* report) { m_report = report; }

    /// The text that the lines are part of.
    const FileText& Text() const { return *m_text; }
    std::size_t LineCount() const { return m_lines.size(); }
    std::string_view Line(std::size_t index) const
    {
        const char* const start = m_text->Bytes().data();
        return {start + m_lines[index].begin, start + m_lines[index].end};
    }
    /// The number of a line in the text, counted from 1.
    std::int32_t LineNumber(std::size_t index) const
    {
        return m_firstNumber + static_cast<std::int32_t>(index);
    }
    /// The number of bytes from the first line to the last.
    std::size_t Size() const
    {
        return m_lines.empty() ? 0 : m_lines.back().end - m_lines.front().begin;
    }

private:
    /// Positions in the text, which is smaller than 4 GiB.
    struct Span
    {
        std::uint32_t begin;
        std::uint32_t end;
    };

    const FileText* m_text = nullptr;
    BlockReport* m_report = nullptr;
    std::int32_t m_firstNumber = 1;
    std::vector<Span> m_lines;
};

/// Takes the lines up to the next empty one off `rest`, the end of the text that the block was
/// begun for. Returns false when no empty line follows: `rest` is then what has no line feed.
inline bool TakeBlock(std::string_view& rest, FileBlock& block)
{
    std::string_view line;
    while (TakeFileLine(rest, line)) {
        if (line.empty())
            return true;
        block.AddLine(line);
    }
    return false;
}

/// Whether anything but zeros and white space follows the first zero.
bool HasTextAfterZero(std::string_view bytes);

/// A block's text that comes from the host: text after the last line feed is not read, and a text
/// that begins with a line feed has no lines.
class HostBlock
{
public:
    /// Throws `std::bad_alloc` for a text of 4 GiB and more.
    explicit HostBlock(std::wstring_view text);
    HostBlock(const HostBlock&) = delete;
    HostBlock& operator=(const HostBlock&) = delete;

    const FileBlock& Block() const { return m_block; }

private:
    FileText m_text;
    FileBlock m_block;
};

} // namespace dcm
