#pragma once

#include "dcm/platform/cstring.h"
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

/// The findings of one import or export. Nothing here throws: a finding for which there is no
/// memory is counted and not listed.
class FindingList
{
public:
    /// Lists up to `limit` findings of each kind.
    explicit FindingList(std::size_t limit) noexcept : m_limit(limit) {}

    /// Adds a finding; line 0 for none. The message is made of the pieces only when it is listed.
    void Add(FindingKind kind, Severity severity, std::int64_t line, const CString& block,
             std::initializer_list<std::wstring_view> message) noexcept;
    /// Sorts the list by lines, findings of equal lines in the order in which they were added, and
    /// those without a line last.
    void Sort() noexcept;

    const std::vector<Finding>& List() const noexcept { return m_list; }
    std::size_t Count(FindingKind kind) const noexcept
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
