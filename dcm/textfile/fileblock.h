#pragma once

#include "dcm/platform/codepage.h"

#include <cstdint>
#include <string_view>
#include <vector>

// The library's own, not exported.
/// @cond

namespace dcm {

/// One block of a text: its lines without their line ends. Valid as long as the text.
class FileBlock
{
public:
    /// No lines.
    explicit FileBlock(const FileText& file) : m_file(&file) {}

    /// Removes the lines and keeps their memory.
    void Clear() { m_lines.clear(); }
    /// Adds a line, which is a part of the text.
    void AddLine(std::string_view line)
    {
        const auto begin = static_cast<std::uint32_t>(line.data() - m_file->bytes.get());
        m_lines.push_back({begin, begin + static_cast<std::uint32_t>(line.size())});
    }

    std::size_t LineCount() const { return m_lines.size(); }
    FileTextView Line(std::size_t index) const
    {
        const char* const start = m_file->bytes.get();
        return {{start + m_lines[index].begin, start + m_lines[index].end}, m_file};
    }
    /// The bytes from the first line to the last.
    std::size_t Size() const
    {
        return m_lines.empty() ? 0 : m_lines.back().end - m_lines.front().begin;
    }

private:
    /// Positions in the text, which is below 4 GiB.
    struct Span
    {
        std::uint32_t begin;
        std::uint32_t end;
    };

    const FileText* m_file;
    std::vector<Span> m_lines;
};

/// A block's text that comes from the host: only a line feed ends a line, text behind the last one
/// is not read, and a text that begins with a line feed has no lines.
class HostBlock
{
public:
    /// Raises `E_OUTOFMEMORY` for a text of 4 GiB and more.
    explicit HostBlock(std::wstring_view text);
    HostBlock(const HostBlock&) = delete;
    HostBlock& operator=(const HostBlock&) = delete;

    const FileBlock& Block() const { return m_block; }

private:
    FileText m_text;
    FileBlock m_block;
};

} // namespace dcm

/// @endcond
