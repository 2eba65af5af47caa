#include "tools/commands/check.h"

#include "tools/dcm_file.h"
#include "tools/findings.h"
#include "tools/input.h"
#include "tools/json_form.h"
#include "tools/output.h"
#include "tools/progress.h"
#include "tools/shown_text.h"
#include "tools/trouble.h"

#include <algorithm>
#include <iterator>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace dcm::tools {

namespace {

/// Findings that a file has as a whole, and that what is written from it has again.
constexpr std::pair<std::string_view, Severity> kOfTheWholeFile[] = {
    {"duplicate-name", Severity::kNote},
    {"looks-like-utf-8", Severity::kWarning},
};

/// The reports of a file.
struct Checked
{
    std::string label;
    Report ofImport;
    Report ofExport;

    std::size_t Count(Severity severity) const
    {
        std::size_t count = ofImport.Count(severity) + ofExport.Count(severity);
        for (const auto& [id, itsSeverity] : kOfTheWholeFile)
            count -= itsSeverity == severity && IsTold(id) ? ofExport.Count(id) : 0;
        return count;
    }
    /// The findings of the import, or those of the export without what the import has told. Lines
    /// of the export are not those of the file.
    std::vector<Finding> FindingsOf(const Report& report) const
    {
        std::vector<Finding> findings = report.Findings();
        if (&report == &ofExport) {
            std::erase_if(findings, [&](const Finding& finding) { return IsTold(finding.id); });
            for (Finding& finding : findings)
                finding.line = 0;
        }
        return findings;
    }
    bool Incomplete() const { return ofImport.Incomplete() || ofExport.Incomplete(); }

private:
    /// Whether a finding of the export with this id says again what the import has told.
    bool IsTold(std::string_view id) const
    {
        return std::any_of(std::begin(kOfTheWholeFile), std::end(kOfTheWholeFile),
                           [&](const auto& known) { return known.first == id; }) &&
               ofImport.Count(id) >= ofExport.Count(id);
    }
};

Checked CheckFile(const std::string& argument, const CheckOptions& options, Progress& progress)
{
    Input input = ReadInput(argument, progress, options.limit);
    // That a host has to ask for the names of shared axes is no finding: parameters ask for them.
    const DCMConverter copy = DocumentOf(ParametersOf(std::move(input.document)), {});
    Report ofExport = ReportOfExport(copy, options.limit);
    return {std::move(input.label), std::move(input.report), std::move(ofExport)};
}

void PrintText(const Checked& checked)
{
    for (const Report* report : {&checked.ofImport, &checked.ofExport}) {
        for (const Finding& finding : checked.FindingsOf(*report))
            Print(FindingText(checked.label, finding, Painted) + '\n');
    }
    if (checked.Incomplete()) {
        Complain(Shown(checked.label) + ": not all findings are listed; there are " +
                 Counted(checked.Count(Severity::kError), "error") + ", " +
                 Counted(checked.Count(Severity::kWarning), "warning") + " and " +
                 Counted(checked.Count(Severity::kNote), "note"));
    }
}

Json JsonOfFindings(const std::vector<Finding>& list)
{
    Json findings = Json::array();
    for (const Finding& finding : list) {
        findings.push_back({{"severity", ToUtf8(NameOf(finding.severity))},
                            {"id", finding.id},
                            {"line", finding.line},
                            {"block", ToUtf8(finding.block.View())},
                            {"message", ToUtf8(finding.message.View())}});
    }
    return findings;
}

Json JsonOf(const Checked& checked)
{
    return {{"file", checked.label},
            {"errors", checked.Count(Severity::kError)},
            {"warnings", checked.Count(Severity::kWarning)},
            {"notes", checked.Count(Severity::kNote)},
            {"incomplete", checked.Incomplete()},
            {"import", JsonOfFindings(checked.FindingsOf(checked.ofImport))},
            {"export", JsonOfFindings(checked.FindingsOf(checked.ofExport))}};
}

/// Whether a file has findings from a severity on.
bool Fails(const Checked& checked, Severity failOn)
{
    return std::any_of(kSeverities.begin(), kSeverities.end(), [&](Severity severity) {
        return severity >= failOn && checked.Count(severity) > 0;
    });
}

} // namespace

int Check(const CheckOptions& options)
{
    RequireOneStandardInput(options.files);
    Progress progress(options.files.size());
    Json files = Json::array();
    int result = 0;
    for (const std::string& file : options.files) {
        try {
            const Checked checked = CheckFile(file, options, progress);
            progress.Pause();
            if (options.json) {
                files.push_back(JsonOf(checked));
            } else {
                PrintText(checked);
            }
            result = std::max(result, Fails(checked, options.failOn) ? 1 : 0);
        } catch (const Trouble& trouble) {
            progress.Pause();
            Complain(trouble.what());
            result = kTrouble;
        }
    }
    if (options.json) {
        Print(JsonText({{"format", "dcm-check"}, {"version", 1}, {"files", std::move(files)}}) +
              '\n');
    }
    return result;
}

} // namespace dcm::tools
