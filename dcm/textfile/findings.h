#pragma once

#include "dcm/platform/cstring.h"
#include "dcm/textfile/file_text.h"
#include "dcm/textfile/finding.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <string_view>
#include <vector>

/// What readers and writers report to.
namespace dcm {

/// The kinds of findings, in the alphabetical order of their ids.
enum class FindingKind : unsigned char
{
    kAxisAndValuesDiffer,
    kBlankSeparator,
    kBlockInComment,
    kBlockInsideBlock,
    kByteOrderMark,
    kCannotOpen,
    kCannotRead,
    kCannotWrite,
    kCharacterReplaced,
    kCountDiffers,
    kCountNotRead,
    kDigitsDropped,
    kDistributionDiffers,
    kDroppedComment,
    kDuplicateName,
    kEmptyMap,
    kEmptyTextDropped,
    kIncompleteMap,
    kLooksLikeUtf8,
    kLostNan,
    kMissingEnd,
    kMixedTypes,
    kNoLineEnd,
    kNoName,
    kNoValue,
    kNotInCodePage,
    kNumberCut,
    kNumbersAmongTexts,
    kNumbersAndTexts,
    kOpenQuote,
    kOutOfMemory,
    kOutOfRange,
    kReferenceNotWritten,
    kRejectedBlock,
    kRepeatedLine,
    kRowDiffers,
    kStopped,
    kSurplusValues,
    kTabAfterKeyword,
    kTextAfterEnd,
    kTextAfterZero,
    kTextAltered,
    kTextAmongNumbers,
    kTextTrimmed,
    kTruthWord,
    kUnfinishedBlock,
    kUnknownBlock,
    kUnknownDistribution,
    kUnknownLine,
    kUnreadableNumber,
    kValueNotWritten,
    kVariantLine,
    kVersionNotKept,
};

inline constexpr std::size_t kFindingKinds =
    static_cast<std::size_t>(FindingKind::kVersionNotKept) + 1;

/// The ids of the kinds, in their order.
extern const std::array<std::string_view, kFindingKinds> kFindingIds;

/// The severity that findings of the kind have as a rule.
Severity SeverityOf(FindingKind kind) noexcept;

/// The most characters of a text that a message quotes. Three such texts fit into a message.
inline constexpr std::size_t kQuotedMax = 64;

/// A part of a message: words, a number, or a text of the file or host, which is shown in double
/// quotes, without control characters and cut to `kQuotedMax`.
class MessagePart
{
public:
    MessagePart(const wchar_t* words) : m_wide(words) {}
    MessagePart(std::wstring_view words) : m_wide(words) {}
    MessagePart(const CString& words) : m_wide(words) {}
    MessagePart(std::int64_t number) : m_type(Type::kNumber), m_number(number) {}
    MessagePart(std::size_t number) : MessagePart(static_cast<std::int64_t>(number)) {}

    /// A text of the host.
    static MessagePart Quoted(std::wstring_view text)
    {
        MessagePart part(text);
        part.m_type = Type::kQuoted;
        return part;
    }
    /// A part of `text`, which is decoded when the message is made.
    static MessagePart Quoted(std::string_view part, const FileText& text)
    {
        MessagePart result(L"");
        result.m_type = Type::kQuotedBytes;
        result.m_bytes = part;
        result.m_text = &text;
        return result;
    }

    void AppendTo(CString& message) const;

private:
    enum class Type : unsigned char
    {
        kWords,
        kNumber,
        kQuoted,
        kQuotedBytes,
    };

    Type m_type = Type::kWords;
    std::wstring_view m_wide;
    std::string_view m_bytes;
    const FileText* m_text = nullptr;
    std::int64_t m_number = 0;
};

/// The findings of one import or export. Nothing here throws: a finding for which there is no
/// memory is counted and not listed.
class FindingList
{
public:
    /// Lists up to `limit` findings of each kind.
    explicit FindingList(std::size_t limit) noexcept : m_limit(limit) {}

    /// Counts a finding; returns whether it is to be listed too.
    bool Count(FindingKind kind, Severity severity) noexcept;
    /// Lists a finding that was counted; line 0 for none.
    void List(FindingKind kind, Severity severity, std::int64_t line, const CString& block,
              std::initializer_list<MessagePart> message) noexcept;
    /// Both.
    void Add(FindingKind kind, Severity severity, std::int64_t line, const CString& block,
             std::initializer_list<MessagePart> message) noexcept
    {
        if (Count(kind, severity))
            List(kind, severity, line, block, message);
    }
    /// Says that a finding could not be listed.
    void Miss() noexcept { m_incomplete = true; }
    /// Sorts the list by lines, findings of equal lines in the order in which they were added, and
    /// those without a line last.
    void Sort() noexcept;

    const std::vector<Finding>& All() const noexcept { return m_list; }
    std::size_t CountOf(FindingKind kind) const noexcept
    {
        return m_counts[static_cast<std::size_t>(kind)];
    }
    const std::array<std::size_t, 3>& CountsBySeverity() const noexcept { return m_bySeverity; }
    /// Whether findings are missing from the list.
    bool Incomplete() const noexcept { return m_incomplete; }

private:
    std::vector<Finding> m_list;
    std::array<std::size_t, kFindingKinds> m_counts{};
    std::array<std::size_t, 3> m_bySeverity{};
    std::size_t m_limit;
    bool m_incomplete = false;
};

} // namespace dcm
