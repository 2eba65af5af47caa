#include "tools/dcm_file.h"

#include "tools/shown_text.h"
#include "tools/system/system.h"
#include "tools/trouble.h"

#include <cstddef>
#include <string>
#include <utility>
#include <vector>

namespace dcm::tools {

DCMConverter DocumentOf(std::vector<Parameter> parameters, const CString& comment)
{
    DCMConverter document;
    for (Parameter& parameter : parameters)
        Add(document, std::move(parameter));
    document.SetHeader(HeaderOfComment(comment));
    return document;
}

Report ReportOfExport(const DCMConverter& document, std::size_t limit)
{
    Report report;
    report.SetLimit(limit);
    Export(document, NullDevice(), report);
    return report;
}

void SaveFile(const DCMConverter& document, const std::string& path)
{
    const HoldInterrupts hold;
    Report report;
    if (SUCCEEDED(Save(document, FromUtf8(path), report)))
        return;
    for (const Finding& finding : report.Findings()) {
        if (finding.severity == Severity::kError)
            throw Trouble(Shown(path) + ": " + Shown(finding.message.View()));
    }
    throw Trouble(Shown(path) + ": cannot write the file");
}

} // namespace dcm::tools
