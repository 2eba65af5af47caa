#pragma once

#include "dcm/elements/block_report.h"
#include "dcm/platform/cstring.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/file_text.h"

#include <cstddef>
#include <string_view>

/// Reading the lines of one block.
namespace dcm {

/// One line of a block: its keyword, and all that follows the first blank after it.
struct BlockLine
{
    std::string_view keyword;
    std::string_view rest;

    bool Is(std::wstring_view other) const { return EqualsNoCase(keyword, other); }
};

/// Cuts a line, before which white space is skipped, at the first blank; false when it has none.
bool CutLine(std::string_view bytes, BlockLine& line);

/// Takes the first word off `rest`: the text before the first blank. `rest` keeps what follows,
/// without white space at its ends. Without a blank the word is empty and `rest` keeps all of it.
/// Callers must strip leading white space first.
std::string_view TakeWord(std::string_view& rest);

/// Walks over the lines of a block that have a keyword and a blank. White space before a keyword is
/// skipped.
class BlockReader
{
public:
    /// The block must outlive the reader.
    explicit BlockReader(const FileBlock& block) : m_block(block), m_report(block.Report()) {}

    /// Takes the next such line; false at the end of the block.
    bool Next(BlockLine& line)
    {
        while (m_next < m_block.LineCount()) {
            const std::string_view bytes = m_block.Line(m_next++);
            const bool found = CutLine(bytes, line);
            if (m_report != nullptr)
                ReportLine(bytes, found ? &line : nullptr);
            if (found)
                return true;
        }
        if (m_report != nullptr)
            m_report->End();
        return false;
    }

    /// The block's text, which turns parts of a line into wide texts.
    const FileText& Text() const { return m_block.Text(); }
    /// Takes the findings of the reader; null when nothing is reported.
    BlockReport* Report() const { return m_report; }
    /// The wide form of what the line taken last sets: a name that is all of its rest or its first
    /// word, an attribute or unit, or the name of a distribution.
    CString Name(std::string_view part) const
    {
        if (m_report != nullptr)
            m_report->Name(part);
        return Text().Wide(part);
    }
    CString NameWord(std::string_view part) const
    {
        if (m_report != nullptr)
            m_report->NameWord(part);
        return Text().Wide(part);
    }
    CString Attribute(std::string_view part) const
    {
        if (m_report != nullptr)
            m_report->Attribute(part);
        return Text().SharedWide(part);
    }
    CString Reference(std::string_view part) const
    {
        if (m_report != nullptr)
            m_report->Reference();
        return Text().SharedWide(part);
    }

    /// Says that the line taken last has no keyword of the block's kind.
    void UnknownLine() const
    {
        if (m_report != nullptr)
            m_report->UnknownLine();
    }

private:
    void ReportLine(std::string_view bytes, const BlockLine* line) const
    {
        if (line != nullptr) {
            m_report->KeywordLine(m_next - 1, line->keyword, line->rest);
        } else {
            m_report->OtherLine(m_next - 1, bytes);
        }
    }

    const FileBlock& m_block;
    BlockReport* m_report;
    std::size_t m_next = 0;
};

} // namespace dcm
