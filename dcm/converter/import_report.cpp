#include "dcm/converter/import_report.h"

#include "dcm/converter/dcmconverter.h"
#include "dcm/converter/document_io.h"
#include "dcm/elements/kennfeld.h"
#include "dcm/elements/kennlinie.h"
#include "dcm/elements/stuetzstellenverteilung.h"
#include "dcm/platform/encoding.h"
#include "dcm/platform/text.h"

#include <algorithm>
#include <functional>
#include <vector>

namespace dcm {

namespace {

constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
constexpr std::string_view kReplacement = "\xEF\xBF\xBD";

std::int64_t LineAt(std::string_view bytes, std::size_t at, std::int32_t number)
{
    const std::string_view before = bytes.substr(0, at);
    return number + std::count(before.begin(), before.end(), '\n');
}

bool SamePoint(const CComVariant& a, const CComVariant& b)
{
    if (a.vt != b.vt)
        return false;
    if (a.vt == VT_BSTR)
        return CComVariant::TextOf(a) == CComVariant::TextOf(b);
    return a.vt != VT_R8 || a.dblVal == b.dblVal;
}

} // namespace

void ImportReport::BeginText(const FileText& text, std::int32_t number) noexcept
{
    const std::string_view bytes = text.Bytes();
    const std::size_t zero = bytes.find('\0');
    std::string_view read = bytes.substr(0, zero);
    const FileText::Origin& origin = text.OriginOfBytes();
    if (origin.textAfterZero || (zero != bytes.npos && HasTextAfterZero(bytes))) {
        Add(FindingKind::kTextAfterZero, Severity::kError, LineAt(read, read.npos, number), {},
            {L"A zero byte ends the text; what follows it in the file is not read."});
    }
    auto bad = BlockReport::BadBytes::kNone;
    std::size_t skipped = 0;
    if (number == 1 && read.starts_with(kByteOrderMark)) {
        skipped = kByteOrderMark.size();
        read.remove_prefix(skipped);
    }
    if (origin.converted) {
        if (read.find(kReplacement) != read.npos)
            bad = BlockReport::BadBytes::kReplaced;
        m_maybeUtf8 = m_maybeUtf8 || origin.looksLikeUtf8;
        m_utf8Line = number;
    } else {
        const Utf8Look look = LookAsUtf8(read);
        if (text.EncodingOfBytes() == Encoding::kUtf8) {
            if (look.firstBad != read.npos)
                bad = BlockReport::BadBytes::kThere;
        } else {
            m_notUtf8 = m_notUtf8 || look.firstBad != read.npos;
            if (look.firstWide != read.npos && !m_maybeUtf8) {
                m_maybeUtf8 = true;
                m_utf8Line = LineAt(read, look.firstWide, number);
            }
        }
    }
    m_block.SetBadBytes(bad);
}

void ImportReport::Keep(const DCMBaseType& stored, std::size_t kind, std::int64_t line,
                        const std::vector<std::int32_t>& variantLines, bool references) noexcept
{
    try {
        const std::size_t hash = std::hash<std::wstring_view>()(stored.GetName()) + kind;
        if (!m_kept)
            m_kept.emplace();
        const auto firstVariant = static_cast<std::uint32_t>(m_variantLines.size());
        m_variantLines.insert(m_variantLines.end(), variantLines.begin(), variantLines.end());
        m_kept->push_back({hash, &stored, static_cast<std::int32_t>(line), firstVariant,
                           static_cast<std::uint32_t>(variantLines.size()),
                           static_cast<unsigned char>(kind), references});
    } catch (...) {
        m_findings.Miss();
    }
}

void ImportReport::Unfinished(const FileBlock& block, bool lineEnds) noexcept
{
    if (block.LineCount() == 0)
        return;
    const std::size_t errors = m_findings.CountOf(FindingKind::kUnfinishedBlock);
    m_block.Skipped(block, true);
    const std::size_t last = block.LineCount() - 1;
    if (!lineEnds && !TrimWhite(block.Line(last)).empty() &&
        m_findings.CountOf(FindingKind::kUnfinishedBlock) == errors) {
        Add(FindingKind::kNoLineEnd, Severity::kNote, block.LineNumber(last), {},
            {L"The last line of the file has no line end."});
    }
}

void ImportReport::End(const DCMConverter& document) noexcept
{
    if (m_maybeUtf8 && !m_notUtf8) {
        Add(FindingKind::kLooksLikeUtf8, Severity::kWarning, m_utf8Line, {},
            {L"The file looks like UTF-8, but is read in another code page."});
    }
    if (!m_kept)
        return;
    try {
        const auto refers = [](const Kept& kept) { return kept.references; };
        if (std::any_of(m_kept->begin(), m_kept->end(), refers)) {
            SetDistributions(document);
            for (const Kept& kept : *m_kept) {
                if (kept.references)
                    CompareAxes(*kept.block, kept.kind, kept.line);
            }
        }
        CompareNames();
    } catch (...) {
        m_findings.Miss();
    }
}

void ImportReport::CompareNames()
{
    std::sort(m_kept->begin(), m_kept->end(), [](const Kept& a, const Kept& b) {
        return a.hash != b.hash ? a.hash < b.hash : a.line < b.line;
    });
    for (auto group = m_kept->begin(); group != m_kept->end();) {
        const auto end = std::find_if(group, m_kept->end(),
                                      [&](const Kept& kept) { return kept.hash != group->hash; });
        const bool repeats = end - group > 1;
        for (auto kept = group; kept != end; ++kept) {
            // Different names with equal hashes are next to impossible; they would only turn a note
            // into a warning.
            for (std::uint32_t i = 0; i < kept->variants; ++i) {
                Add(FindingKind::kVariantLine, repeats ? Severity::kWarning : Severity::kNote,
                    m_variantLines[kept->firstVariant + i], LabelOf(*kept->block, kept->kind),
                    {L"What tells variants of the parameter apart is not kept."});
            }
            if (kept != group && kept->block->GetName() == group->block->GetName()) {
                Add(FindingKind::kDuplicateName, Severity::kNote, kept->line,
                    LabelOf(*kept->block, kept->kind),
                    {L"The block in line ", std::int64_t{group->line},
                     L" has the same kind and name."});
            }
        }
        group = end;
    }
}

void ImportReport::SetDistributions(const DCMConverter& document)
{
    for (const auto& distribution : DocumentIo::Distributions(document))
        m_distributions.emplace(distribution.GetName().View(), &distribution);
}

void ImportReport::CompareAxes(const DCMBaseType& block, std::size_t kind, std::int64_t line)
{
    const auto compare = [&](std::wstring_view name, auto getPoints) {
        if (name.empty())
            return;
        const auto found = m_distributions.find(name);
        if (found == m_distributions.end()) {
            Add(FindingKind::kUnknownDistribution, Severity::kNote, line, LabelOf(block, kind),
                {L"There is no distribution ", MessagePart::Quoted(name), L"."});
            return;
        }
        std::vector<CComVariant> points, shared;
        getPoints(points);
        if (points.empty())
            return;
        found->second->GetValues(shared);
        if (!std::equal(points.begin(), points.end(), shared.begin(), shared.end(), SamePoint)) {
            Add(FindingKind::kDistributionDiffers, Severity::kWarning, line, LabelOf(block, kind),
                {L"The axis points differ from those of the distribution ",
                 MessagePart::Quoted(name), L"."});
        }
    };
    if (const auto* const curve = dynamic_cast<const DCMKennlinie*>(&block)) {
        compare(curve->GetStuetzstellenverteilung(), [&](auto& points) { curve->GetAxis(points); });
    } else if (const auto* const map = dynamic_cast<const DCMKennfeld*>(&block)) {
        compare(map->GetStuetzstellenverteilungX(), [&](auto& points) { map->GetAxis_X(points); });
        compare(map->GetStuetzstellenverteilungY(), [&](auto& points) { map->GetAxis_Y(points); });
    }
}

CString ImportReport::LabelOf(const DCMBaseType& block, std::size_t kind)
{
    CString label(DocumentIo::KeywordOf(kind));
    return label.Append(L" ").Append(block.GetName());
}

} // namespace dcm
