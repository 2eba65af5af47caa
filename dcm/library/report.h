#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cfile.h"
#include "dcm/platform/cstring.h"
#include "dcm/textfile/finding.h"

#include <array>
#include <cstddef>
#include <memory>
#include <span>
#include <string_view>
#include <vector>

class DCMConverter;

/// @file
/// Import and export with a report of all that they met.

namespace dcm {

/// L"note", L"warning" or L"error".
DCM_API std::wstring_view NameOf(Severity severity) noexcept;

/// All ids that a finding can have, in alphabetical order.
DCM_API std::span<const std::string_view> FindingIds() noexcept;

/// What an import or export met. A report belongs to one thread at a time.
class DCM_API Report
{
public:
    /// No findings.
    Report() noexcept;
    /// The findings of the other report, its counts and its limit.
    Report(const Report& other);
    Report(Report&& other) noexcept;
    Report& operator=(const Report& other);
    Report& operator=(Report&& other) noexcept;
    ~Report();

    /// The findings in the order of their lines; those that concern no line come last. Valid until
    /// the report is changed or used again.
    const std::vector<Finding>& Findings() const noexcept;
    /// How many findings there were of this severity, of this id, and in all; findings that are
    /// not listed because of the limit are counted.
    std::size_t Count(Severity severity) const noexcept;
    std::size_t Count(std::string_view id) const noexcept;
    std::size_t Count() const noexcept;
    /// One line: "2 errors, 1 warning, 3 notes"; "no findings" when there are none.
    CString Summary() const;

    /// How many findings of one id are listed; 1000 unless it is set. The limit stays when the
    /// report is used again.
    void SetLimit(std::size_t findingsPerId) noexcept;
    std::size_t Limit() const noexcept;
    /// Whether findings are missing from the list: an id met its limit, or memory ran out.
    bool Incomplete() const noexcept;

    /// Why the file could not be opened, read or written; `CFileException::none` when it could, or
    /// when something else ended the work. After `sharingViolation` try again later.
    CFileException::Cause Cause() const noexcept;
    /// The system's own number of that error; 0 when the system reported none.
    long SystemError() const noexcept;

private:
    friend struct ReportAccess;
    struct Content;

    std::unique_ptr<Content> m_content;
    /// By severity. Kept here, so that they are right when there is no memory for the content.
    std::array<std::size_t, 3> m_counts{};
    std::size_t m_limit = 1000;
    bool m_incomplete = false;
    CFileException::Cause m_cause = CFileException::none;
    long m_systemError = 0;
};

/// Does what `document.Import(path)` does, with the same result, and reports all that the file
/// says and the document does not hold, or holds altered or in doubt. The report is emptied first.
/// Throws nothing.
DCM_API HRESULT Import(DCMConverter& document, const CString& path, Report& report);

/// Does what `document.Export(path)` does, with the same result, and reports what the document
/// holds and the file does not. The report is emptied first. Throws nothing.
DCM_API HRESULT Export(const DCMConverter& document, const CString& path, Report& report);

/// Exports to a new file beside the one at `path`, writes it through to the disk and renames it:
/// the file at `path` is always either whole and old or whole and new. A link is followed, and
/// the mode of an existing file is kept. Where the path is not a regular file, such as a device, it
/// is written directly. Returns 0, or `E_UNEXPECTED` when that fails: the old file is then as it
/// was, and the new one is removed. The report is emptied first. Throws nothing.
DCM_API HRESULT Save(const DCMConverter& document, const CString& path, Report& report);

/// The path of the system's null device. An export to it reports what a file would lose and
/// writes nothing.
DCM_API CString NullDevice();

} // namespace dcm
