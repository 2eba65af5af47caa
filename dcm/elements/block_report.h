#pragma once

#include "dcm/platform/cstring.h"
#include "dcm/textfile/file_text.h"
#include "dcm/textfile/findings.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <optional>
#include <string_view>
#include <utility>
#include <vector>

class DCMBaseType;

/// What the readers of blocks report. Nothing here throws.
namespace dcm {

/// Whether the text is the keyword of one of the ten kinds of blocks, in letters of any case.
bool IsKindKeyword(std::string_view word);
/// The text before the first white space.
std::string_view WordOf(std::string_view text);

/// Compares the rows of a map with the points of its axes, line by line.
class RowCheck
{
public:
    /// Tells how many points of Y and how many values there are after a line, whose number is
    /// `line`.
    void AfterLine(std::size_t points, std::size_t values, std::int64_t line);
    /// The first line whose points of Y have too few or too many values for an X axis of `width`
    /// points, so that values move to other rows; 0 for none. The last row does not count.
    std::int64_t FirstMoved(std::size_t width) const;

private:
    void EndGroup();

    std::size_t m_points = 0;
    std::size_t m_values = 0;
    /// The points of Y whose rows are being read, and the values since then.
    std::size_t m_groupPoints = 0;
    std::size_t m_groupValues = 0;
    std::int64_t m_groupLine = 0;
    /// Values a point of the first row, and the first line that differs from that.
    std::size_t m_width = 0;
    bool m_anyGroup = false;
    std::int64_t m_firstLine = 0;
    std::int64_t m_moved = 0;
};

/// Takes note of what the readers of a file meet, block by block and line by line.
class BlockReport
{
public:
    explicit BlockReport(FindingList& findings) : m_findings(findings) {}
    BlockReport(const BlockReport&) = delete;
    BlockReport& operator=(const BlockReport&) = delete;

    /// Bytes of a file that are no characters.
    enum class BadBytes : unsigned char
    {
        kNone,
        /// They are in the text.
        kThere,
        /// They were replaced by U+FFFD when the text was converted.
        kReplaced,
    };
    void SetBadBytes(BadBytes badBytes) { m_badBytes = badBytes; }
    /// From here on the blocks are compared with those that they were written from. What is found
    /// altered is not reported; the worst of a block can be taken.
    void LeaveAlteredToComparison() { m_compared = true; }
    /// A kind of finding with its severity.
    struct Altered
    {
        FindingKind kind;
        Severity severity;
    };
    std::optional<Altered> TakeAltered() { return std::exchange(m_altered, std::nullopt); }

    // For who cuts the file into blocks.

    /// Begins a block of the kind with this index, which a reader reads next.
    void BeginKind(const FileBlock& block, std::size_t kind);
    /// A block that is kept as the comment.
    void Comment(const FileBlock& block);
    /// A block that declares the version.
    void Version(const FileBlock& block);
    /// A block that is not read, or what is left at the end of the file, `unfinished`.
    void Skipped(const FileBlock& block, bool unfinished);

    // For BlockReader.

    /// A line with a keyword and a blank, which a reader looks at next.
    void KeywordLine(std::size_t index, std::string_view keyword, std::string_view rest);
    /// A line without a blank, which no reader sees.
    void OtherLine(std::size_t index, std::string_view bytes);
    /// No line is left.
    void End();

    // For the readers of the kinds. They concern the keyword line seen last.

    /// The line has a keyword that the kind does not have.
    void UnknownLine();
    /// The block is not kept because of the line.
    void Rejected();
    /// What was kept as the name.
    void Name(std::string_view kept);
    /// Like `Name`, for a name that ends with the first blank.
    void NameWord(std::string_view kept);
    /// What was kept of an attribute or unit.
    void Attribute(std::string_view kept);
    /// The name of a distribution, kept as it is.
    void Reference();
    /// The single value of a block: a number, a text or a truth word.
    void SingleNumber(std::string_view token, double value);
    void SingleText(std::string_view kept);
    void TruthWord();
    /// What was kept of a line of numbers, without quotes.
    void Numbers(std::string_view kept);
    /// One number of a line was read from `token` as `value`.
    void Number(std::string_view token, double value);
    /// The items on the line are not kept: texts under a keyword for numbers, or the reverse.
    void DroppedItems(bool texts);
    /// Items on the line have another type than those before them, and no value for that.
    void MixedTypes();
    /// How many points of Y and values a map has after the line.
    void AfterPoints(std::size_t points, std::size_t values)
    {
        m_rows.AfterLine(points, values, m_line);
    }
    /// A double quote on the line has no other one.
    void OpenQuote();
    /// Texts on the line are not what is between its pairs of quotes.
    void TextsAltered();
    /// Texts of a FESTWERTEBLOCK were split; `kept` are the pieces in order.
    void BeginTexts();
    void KeptText(std::string_view kept);
    void EndTexts();

    /// Adds a finding about the current line or the whole block.
    void Add(FindingKind kind, std::initializer_list<MessagePart> message) noexcept
    {
        Add(kind, SeverityOf(kind), m_line, message);
    }
    void AddToBlock(FindingKind kind, std::initializer_list<MessagePart> message) noexcept
    {
        Add(kind, SeverityOf(kind), m_firstLine, message);
    }
    void Add(FindingKind kind, Severity severity, std::int64_t line,
             std::initializer_list<MessagePart> message) noexcept;

    /// Reports a count on the first line that is no plain number, or another than what was read
    /// of it; returns whether it was neither. A count that is missing with the name is not
    /// reported again.
    bool Count(std::string_view text, std::int64_t read);
    /// Reports a count that is not the number of items; the first form one that was not read
    /// either.
    void CompareCount(std::string_view text, std::size_t items, const wchar_t* what);
    void CompareCount(std::int64_t count, std::size_t items, const wchar_t* what);
    void CountDiffers(std::int64_t count, std::size_t items, const wchar_t* what);

    MessagePart Quote(std::string_view part) const;
    /// The block as it was stored, if it was.
    void SetStored(const DCMBaseType* stored) { m_stored = stored; }
    const DCMBaseType* Stored() const { return m_stored; }
    /// The index of the block's kind.
    std::size_t Kind() const { return m_kind; }
    const RowCheck& Rows() const { return m_rows; }
    std::int64_t FirstLine() const { return m_firstLine; }
    std::int64_t Line() const { return m_line; }
    /// The VAR lines of the block.
    const std::vector<std::int32_t>& VariantLines() const { return m_variantLines; }
    bool HasReferenceX() const { return m_referenceX; }
    bool HasReferenceY() const { return m_referenceY; }
    const CString& Label() noexcept;

private:
    struct Slot
    {
        std::string_view keyword;
        std::string_view content;
    };

    void Start(const FileBlock& block);
    void LostKind(std::string_view line, std::string_view word, bool unfinished);
    void OtherBlock(std::string_view line, std::string_view word);
    void DroppedComment(std::string_view line);
    void VersionNotKept(std::string_view line);
    void LookForKinds(std::size_t index);
    bool LookForKind(std::size_t index);
    bool LookForKind(std::size_t index, std::string_view keyword);
    bool TabFollows(std::string_view bytes);
    void LookAtCharacters(std::string_view line);
    void AfterEnd();
    void CheckName(std::string_view kept, std::string_view meant, const wchar_t* none);
    void SingleValue();
    void NoteVariantLine();
    void Repeated(std::string_view keyword, std::string_view content, bool empty);
    bool TakeText(std::string_view& text);
    void EmptyTextDropped();
    std::string_view Line(std::size_t index) const { return m_block->Line(index); }

    FindingList& m_findings;
    const FileBlock* m_block = nullptr;
    CString m_label;
    bool m_labelled = false;
    BadBytes m_badBytes = BadBytes::kNone;
    bool m_compared = false;
    std::optional<Altered> m_altered;
    bool m_inComment = false;
    std::size_t m_index = 0;
    /// Whether the current line needs no further check.
    bool m_known = false;
    std::int64_t m_firstLine = 0;
    std::int64_t m_line = 0;
    std::string_view m_keyword;
    std::string_view m_rest;
    std::array<Slot, 12> m_slots;
    std::size_t m_slotsUsed = 0;
    bool m_end = false;
    bool m_textAfterEnd = false;
    /// Whether the lines from here on are those of another block, which is reported as lost.
    bool m_otherBlock = false;
    bool m_referenceX = false;
    bool m_referenceY = false;
    std::vector<std::int32_t> m_variantLines;
    RowCheck m_rows;
    const DCMBaseType* m_stored = nullptr;
    std::size_t m_kind = 0;
    std::int64_t m_commentLine = 0;
    bool m_noName = false;
    /// What is left of the texts on the line that were not compared yet.
    std::string_view m_texts;
    bool m_quoted = false;
};

} // namespace dcm
