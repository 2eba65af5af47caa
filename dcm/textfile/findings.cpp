#include "dcm/textfile/findings.h"

#include <algorithm>
#include <utility>

namespace dcm {

constexpr std::array<std::string_view, kFindingKinds> kFindingIds = {
    "axis-and-values-differ",
    "blank-separator",
    "block-in-comment",
    "block-inside-block",
    "byte-order-mark",
    "cannot-open",
    "cannot-read",
    "cannot-write",
    "character-replaced",
    "count-differs",
    "count-not-read",
    "digits-dropped",
    "distribution-differs",
    "dropped-comment",
    "duplicate-name",
    "empty-map",
    "empty-text-dropped",
    "incomplete-map",
    "looks-like-utf-8",
    "lost-nan",
    "missing-end",
    "mixed-types",
    "no-line-end",
    "no-name",
    "no-value",
    "not-in-code-page",
    "number-cut",
    "numbers-among-texts",
    "numbers-and-texts",
    "open-quote",
    "out-of-memory",
    "out-of-range",
    "reference-not-written",
    "rejected-block",
    "repeated-line",
    "row-differs",
    "stopped",
    "surplus-values",
    "tab-after-keyword",
    "text-after-end",
    "text-after-zero",
    "text-altered",
    "text-among-numbers",
    "text-trimmed",
    "truth-word",
    "unfinished-block",
    "unknown-block",
    "unknown-distribution",
    "unknown-line",
    "unreadable-number",
    "value-not-written",
    "variant-line",
    "version-not-kept",
};
static_assert(std::ranges::is_sorted(kFindingIds));
static_assert(!kFindingIds.back().empty());

void FindingList::Add(FindingKind kind, Severity severity, std::int64_t line, const CString& block,
                      std::initializer_list<std::wstring_view> message) noexcept
{
    ++m_bySeverity[static_cast<std::size_t>(severity)];
    const auto index = static_cast<std::size_t>(kind);
    if (++m_counts[index] > m_limit) {
        m_incomplete = true;
        return;
    }
    try {
        CString text;
        for (const std::wstring_view piece : message)
            text.Append(piece);
        m_list.push_back({severity, kFindingIds[index], line, block, std::move(text)});
    } catch (...) {
        m_incomplete = true;
    }
}

void FindingList::Sort() noexcept
{
    std::stable_sort(m_list.begin(), m_list.end(), [](const Finding& a, const Finding& b) {
        return static_cast<std::uint64_t>(a.line) - 1 < static_cast<std::uint64_t>(b.line) - 1;
    });
}

} // namespace dcm
