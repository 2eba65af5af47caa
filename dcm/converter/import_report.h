#pragma once

#include "dcm/elements/block_report.h"
#include "dcm/platform/cstring.h"
#include "dcm/platform/variant.h"
#include "dcm/textfile/file_text.h"
#include "dcm/textfile/findings.h"

#include <cstddef>
#include <cstdint>
#include <deque>
#include <initializer_list>
#include <optional>
#include <string_view>
#include <unordered_map>
#include <vector>

class DCMBaseType;
class DCMConverter;
class DCMKennfeld;
class DCMKennlinie;
class DCMStuetzstellenverteilung;

namespace dcm {

/// Takes note of what concerns more than one block of a file: its bytes, names that repeat and
/// shared axes. Nothing here throws; what has no memory is missing from the findings.
class ImportReport
{
public:
    explicit ImportReport(FindingList& findings) : m_findings(findings), m_block(findings) {}

    /// Looks at the text that blocks are taken from next; its first line is line `number`. An
    /// import has one text, an export has many.
    void BeginText(const FileText& text, std::int32_t number) noexcept;
    /// Takes note of a block that was read and stored. `stored` must stay valid until the end.
    void Keep(const DCMBaseType& stored, std::size_t kind, std::int64_t line,
              const std::vector<std::int32_t>& variantLines, bool references) noexcept;
    /// What is left after the last empty line; the last line need not have a line end.
    void Unfinished(const FileBlock& block, bool lineEnds) noexcept;
    /// Compares the names of all blocks that were kept, and their axes with the distributions of
    /// the document.
    void End(const DCMConverter& document) noexcept;
    /// The names of the distributions that `document` has.
    void SetDistributions(const DCMConverter& document);
    /// Compares the axes of a block with the distributions that it names.
    void CompareAxes(const DCMBaseType& block, std::size_t kind, std::int64_t line);

    BlockReport& Block() { return m_block; }

private:
    /// A block that was kept.
    struct Kept
    {
        std::size_t hash;
        const DCMBaseType* block;
        std::int32_t line;
        /// Which of m_variantLines are the block's.
        std::uint32_t firstVariant;
        std::uint32_t variants;
        unsigned char kind;
        bool references;
    };

    void CompareNames();
    static CString LabelOf(const DCMBaseType& block, std::size_t kind);
    void Add(FindingKind kind, Severity severity, std::int64_t line, const CString& block,
             std::initializer_list<MessagePart> message) noexcept
    {
        m_findings.Add(kind, severity, line, block, message);
    }

    FindingList& m_findings;
    BlockReport m_block;
    /// Made with the first block, since an empty one takes memory too.
    std::optional<std::deque<Kept>> m_kept;
    /// The VAR lines of all of them.
    std::vector<std::int32_t> m_variantLines;
    std::unordered_map<std::wstring_view, const DCMStuetzstellenverteilung*> m_distributions;
    /// Whether bytes were met that are no UTF-8, and the line of the first that may be.
    bool m_notUtf8 = false;
    bool m_maybeUtf8 = false;
    std::int64_t m_utf8Line = 0;
};

} // namespace dcm
