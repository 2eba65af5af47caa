#include "tools/commands/report.h"

#include "dcm/library/dcm.h"
#include "tools/input.h"
#include "tools/progress.h"
#include "tools/report/page.h"
#include "tools/system/system.h"

#include <sstream>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace dcm::tools {

namespace {

/// The path without its folders.
CString FileName(std::string_view path)
{
    return FromUtf8(path.substr(path.find_last_of("/\\") + 1));
}

/// A file with all that its page refers to.
struct Source
{
    Input input;
    CString comment;
    std::vector<Parameter> parameters;

    PageFile Page() const { return {FileName(input.label), comment, parameters, &input.report}; }
};

Source Read(const std::string& argument, Progress& progress)
{
    Source source = {ReadInput(argument, progress), {}, {}};
    source.comment = source.input.document.GetComment();
    source.parameters = ParametersOf(std::move(source.input.document));
    TellErrors(source.input);
    return source;
}

} // namespace

int MakeReport(const ReportOptions& options)
{
    RequireOneStandardInput({options.file, options.other});
    std::ostringstream page;
    if (options.other.empty()) {
        Progress progress(1);
        const Source file = Read(options.file, progress);
        WritePage(page, file.Page());
    } else {
        Progress progress(2);
        const Source file = Read(options.file, progress);
        const Source other = Read(options.other, progress);
        WritePage(page, file.Page(), other.Page(), Differences(file.parameters, other.parameters));
    }
    WriteWholeFile(options.out, page.str());
    return 0;
}

} // namespace dcm::tools
