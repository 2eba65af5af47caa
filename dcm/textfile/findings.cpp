#include "dcm/textfile/findings.h"

#include <algorithm>
#include <cstdint>
#include <limits>
#include <string>
#include <utility>

namespace dcm {

namespace {

constexpr struct
{
    std::string_view id;
    Severity severity;
} kKinds[] = {
    {"axis-and-values-differ", Severity::kWarning},
    {"blank-separator", Severity::kError},
    {"block-in-comment", Severity::kError},
    {"block-inside-block", Severity::kError},
    {"byte-order-mark", Severity::kNote},
    {"cannot-open", Severity::kError},
    {"cannot-read", Severity::kError},
    {"cannot-write", Severity::kError},
    {"character-replaced", Severity::kError},
    {"count-differs", Severity::kWarning},
    {"count-not-read", Severity::kError},
    {"digits-dropped", Severity::kWarning},
    {"distribution-differs", Severity::kWarning},
    {"dropped-comment", Severity::kNote},
    {"duplicate-name", Severity::kNote},
    {"empty-map", Severity::kWarning},
    {"empty-text-dropped", Severity::kError},
    {"incomplete-map", Severity::kWarning},
    {"looks-like-utf-8", Severity::kWarning},
    {"lost-nan", Severity::kError},
    {"missing-end", Severity::kWarning},
    {"mixed-types", Severity::kError},
    {"no-line-end", Severity::kNote},
    {"no-name", Severity::kError},
    {"no-value", Severity::kWarning},
    {"not-in-code-page", Severity::kError},
    {"number-cut", Severity::kError},
    {"numbers-among-texts", Severity::kError},
    {"numbers-and-texts", Severity::kWarning},
    {"open-quote", Severity::kWarning},
    {"out-of-memory", Severity::kError},
    {"out-of-range", Severity::kError},
    {"reference-not-written", Severity::kError},
    {"rejected-block", Severity::kError},
    {"repeated-line", Severity::kError},
    {"row-differs", Severity::kError},
    {"stopped", Severity::kError},
    {"surplus-values", Severity::kWarning},
    {"tab-after-keyword", Severity::kError},
    {"text-after-end", Severity::kWarning},
    {"text-after-zero", Severity::kError},
    {"text-altered", Severity::kWarning},
    {"text-among-numbers", Severity::kError},
    {"text-trimmed", Severity::kWarning},
    {"truth-word", Severity::kWarning},
    {"unfinished-block", Severity::kError},
    {"unknown-block", Severity::kError},
    {"unknown-distribution", Severity::kNote},
    {"unknown-line", Severity::kError},
    {"unreadable-number", Severity::kError},
    {"value-not-written", Severity::kError},
    {"variant-line", Severity::kNote},
    {"version-not-kept", Severity::kNote},
};
static_assert(std::size(kKinds) == kFindingKinds);

constexpr auto IdsOfKinds()
{
    std::array<std::string_view, kFindingKinds> ids;
    std::transform(std::begin(kKinds), std::end(kKinds), ids.begin(),
                   [](const auto& kind) { return kind.id; });
    return ids;
}

} // namespace

constexpr std::array<std::string_view, kFindingKinds> kFindingIds = IdsOfKinds();
static_assert(std::is_sorted(kFindingIds.begin(), kFindingIds.end()));

Severity SeverityOf(FindingKind kind) noexcept
{
    return kKinds[static_cast<std::size_t>(kind)].severity;
}

void MessagePart::AppendTo(CString& message) const
{
    if (m_type == Type::kNumber) {
        message.Append(std::to_wstring(m_number));
        return;
    }
    if (m_type == Type::kWords) {
        message.Append(m_wide);
        return;
    }
    // No character takes more than four bytes.
    std::wstring shown = m_type == Type::kQuoted
                             ? std::wstring(m_wide.substr(0, kQuotedMax + 1))
                             : std::wstring(m_text->Wide(m_bytes.substr(0, 4 * kQuotedMax + 4)));
    const bool cut = shown.size() > kQuotedMax;
    shown.resize(std::min(shown.size(), kQuotedMax));
    std::replace_if(
        shown.begin(), shown.end(),
        [](wchar_t c) { return static_cast<std::uint32_t>(c) < 0x20 || c == 0x7F; }, L'.');
    message.Append(L"\"").Append(shown).Append(cut ? L"...\"" : L"\"");
}

bool FindingList::Count(FindingKind kind, Severity severity) noexcept
{
    ++m_bySeverity[static_cast<std::size_t>(severity)];
    const bool listed = ++m_counts[static_cast<std::size_t>(kind)] <= m_limit;
    m_incomplete = m_incomplete || !listed;
    return listed;
}

void FindingList::List(FindingKind kind, Severity severity, std::int64_t line, const CString& block,
                       std::initializer_list<MessagePart> message) noexcept
{
    try {
        CString text;
        for (const MessagePart& part : message)
            part.AppendTo(text);
        const std::string_view id = kFindingIds[static_cast<std::size_t>(kind)];
        m_list.push_back({severity, id, line, block, std::move(text)});
    } catch (...) {
        Miss();
    }
}

void FindingList::Sort() noexcept
{
    // Those that concern no line come last.
    const auto place = [](const Finding& finding) {
        return finding.line > 0 ? finding.line : std::numeric_limits<std::int64_t>::max();
    };
    std::stable_sort(m_list.begin(), m_list.end(),
                     [&place](const Finding& a, const Finding& b) { return place(a) < place(b); });
}

} // namespace dcm
