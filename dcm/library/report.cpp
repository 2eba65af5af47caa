#include "dcm/library/report.h"

#include "dcm/converter/document_io.h"
#include "dcm/converter/import_report.h"
#include "dcm/library/read_back.h"
#include "dcm/platform/cfile.h"
#include "dcm/platform/codepage.h"
#include "dcm/platform/null_device.h"
#include "dcm/platform/replacement_file.h"
#include "dcm/textfile/findings.h"

#include <algorithm>
#include <iterator>
#include <new>
#include <numeric>
#include <string>
#include <utility>

namespace dcm {

struct Report::Content
{
    FindingList findings;
};

/// Fills a report.
struct ReportAccess
{
    static void Empty(Report& report) noexcept
    {
        report.m_content.reset();
        report.m_counts = {};
        report.m_incomplete = false;
        report.m_cause = CFileException::none;
        report.m_systemError = 0;
    }

    static void SetFailure(Report& report, const CFileException& error) noexcept
    {
        report.m_cause = error.m_cause;
        report.m_systemError = error.m_lOsError;
    }

    /// The findings become the report's content. Without memory for them, only their counts do.
    static void Set(Report& report, FindingList&& findings) noexcept
    {
        findings.Sort();
        report.m_counts = findings.CountsBySeverity();
        report.m_content.reset(new (std::nothrow) Report::Content{std::move(findings)});
        report.m_incomplete = !report.m_content || report.m_content->findings.Incomplete();
    }
};

namespace {

/// What a file is opened for.
enum class Direction : unsigned char
{
    kImport,
    kExport,
};

/// The names of the causes, in their order.
constexpr std::wstring_view kCauseNames[] = {
    L"none",         L"generic",     L"fileNotFound", L"badPath",          L"tooManyOpenFiles",
    L"accessDenied", L"invalidFile", L"hardIO",       L"sharingViolation", L"diskFull",
    L"fileTooLarge",
};
static_assert(std::size(kCauseNames) == CFileException::fileTooLarge + 1);

/// What the system says of a failure, with its cause by name.
CString WordsOf(const CFileException& error) noexcept
{
    try {
        CString words(L" (");
        words.Append(kCauseNames[error.m_cause]).Append(L"): ");
        return words.Append(FromUtf8(error.what())).Append(L".");
    } catch (const std::bad_alloc&) {
        return {};
    }
}

void AddFileFailure(Report& report, FindingList& findings, FileStage stage, Direction direction,
                    const CFileException& error) noexcept
{
    ReportAccess::SetFailure(report, error);
    const auto add = [&](FindingKind kind, std::wstring_view what) {
        findings.Add(kind, Severity::kError, 0, {}, {what, WordsOf(error)});
    };
    if (stage == FileStage::kOpening) {
        add(FindingKind::kCannotOpen, L"The file cannot be opened");
    } else if (direction == Direction::kImport) {
        add(FindingKind::kCannotRead, L"The file cannot be read");
    } else {
        add(FindingKind::kCannotWrite, L"The file cannot be written");
    }
}

/// The failure of an open file for which the system does not answer.
CFileException NoAnswer(const CString& path)
{
    return {CFileException::generic, 0, path};
}

/// Empties the report, runs an import or export and reports its findings and the failure that ended
/// it, unless that was done where it happened.
template <class Work>
HRESULT Run(Report& report, Direction direction, Work work) noexcept
{
    ReportAccess::Empty(report);
    FindingList findings(report.Limit());
    auto stage = FileStage::kOpening;
    HRESULT result = E_UNEXPECTED;
    try {
        work(stage, findings);
        result = S_OK;
    } catch (const CFileException& error) {
        AddFileFailure(report, findings, stage, direction, error);
    } catch (const std::bad_alloc&) {
        if (findings.CountOf(FindingKind::kOutOfMemory) == 0)
            findings.Add(FindingKind::kOutOfMemory, Severity::kError, 0, {}, {L"Memory ran out."});
    } catch (...) {
        // Nothing else is raised but by the reader of a block, which was reported with its line.
    }
    ReportAccess::Set(report, std::move(findings));
    return result;
}

} // namespace

std::wstring_view NameOf(Severity severity) noexcept
{
    switch (severity) {
    case Severity::kNote:
        return L"note";
    case Severity::kWarning:
        return L"warning";
    case Severity::kError:
        break;
    }
    return L"error";
}

std::span<const std::string_view> FindingIds() noexcept
{
    return kFindingIds;
}

Report::Report() noexcept = default;

Report::Report(const Report& other)
    : m_content(other.m_content ? std::make_unique<Content>(*other.m_content) : nullptr),
      m_counts(other.m_counts), m_limit(other.m_limit), m_incomplete(other.m_incomplete),
      m_cause(other.m_cause), m_systemError(other.m_systemError)
{}

Report::Report(Report&& other) noexcept : Report()
{
    *this = std::move(other);
}

Report& Report::operator=(const Report& other)
{
    Report copy(other);
    return *this = std::move(copy);
}

Report& Report::operator=(Report&& other) noexcept
{
    m_content = std::exchange(other.m_content, nullptr);
    m_counts = std::exchange(other.m_counts, {});
    m_limit = other.m_limit;
    m_incomplete = std::exchange(other.m_incomplete, false);
    m_cause = std::exchange(other.m_cause, CFileException::none);
    m_systemError = std::exchange(other.m_systemError, 0);
    return *this;
}

Report::~Report() = default;

const std::vector<Finding>& Report::Findings() const noexcept
{
    static const std::vector<Finding> none;
    return m_content ? m_content->findings.All() : none;
}

std::size_t Report::Count(Severity severity) const noexcept
{
    return m_counts[static_cast<std::size_t>(severity)];
}

std::size_t Report::Count(std::string_view id) const noexcept
{
    const auto* const found = std::lower_bound(kFindingIds.begin(), kFindingIds.end(), id);
    if (!m_content || found == kFindingIds.end() || *found != id)
        return 0;
    return m_content->findings.CountOf(static_cast<FindingKind>(found - kFindingIds.begin()));
}

std::size_t Report::Count() const noexcept
{
    return std::accumulate(m_counts.begin(), m_counts.end(), std::size_t{0});
}

CString Report::Summary() const
{
    CString line;
    for (const Severity severity : {Severity::kError, Severity::kWarning, Severity::kNote}) {
        const std::size_t count = Count(severity);
        if (count == 0)
            continue;
        line.Append(line.IsEmpty() ? L"" : L", ").Append(std::to_wstring(count)).Append(L" ");
        line.Append(NameOf(severity)).Append(count == 1 ? L"" : L"s");
    }
    return line.IsEmpty() ? CString(L"no findings") : line;
}

void Report::SetLimit(std::size_t findingsPerId) noexcept
{
    m_limit = findingsPerId;
}

std::size_t Report::Limit() const noexcept
{
    return m_limit;
}

bool Report::Incomplete() const noexcept
{
    return m_incomplete;
}

CFileException::Cause Report::Cause() const noexcept
{
    return m_cause;
}

long Report::SystemError() const noexcept
{
    return m_systemError;
}

HRESULT Import(DCMConverter& document, const CString& path, Report& report)
{
    return Run(report, Direction::kImport, [&](FileStage& stage, FindingList& findings) {
        ImportReport blocks(findings);
        DocumentIo::Import(document, path, stage, &blocks);
    });
}

HRESULT Export(const DCMConverter& document, const CString& path, Report& report)
{
    return Run(report, Direction::kExport, [&](FileStage& stage, FindingList& findings) {
        if (!ExportAndReadBack(document, path, stage, findings))
            AddFileFailure(report, findings, stage, Direction::kExport, NoAnswer(path));
    });
}

HRESULT Save(const DCMConverter& document, const CString& path, Report& report)
{
    return Run(report, Direction::kExport, [&](FileStage& stage, FindingList& findings) {
        ReplacementFile file(path);
        try {
            if (!ExportAndReadBack(document, file.Path(), stage, findings))
                throw NoAnswer(path);
        } catch (const CFileException& error) {
            throw CFileException(error.m_cause, error.m_lOsError, path);
        }
        file.TakePlace();
    });
}

CString NullDevice()
{
    CString path(system::kNullDevice);
    return path;
}

} // namespace dcm
