#include "tools/commands/convert.h"

#include "dcm/library/dcm.h"
#include "tools/csv_form.h"
#include "tools/dcm_file.h"
#include "tools/findings.h"
#include "tools/input.h"
#include "tools/json_form.h"
#include "tools/output.h"
#include "tools/progress.h"
#include "tools/shown_text.h"
#include "tools/system/system.h"
#include "tools/trouble.h"

#include <array>
#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace dcm::tools {

namespace {

enum class Form
{
    kDcm,
    kJson,
    kCsv,
};

constexpr struct
{
    std::string_view extension;
    Form form;
} kForms[] = {{".dcm", Form::kDcm}, {".json", Form::kJson}, {".csv", Form::kCsv}};

/// The form that the end of a file's name tells, in letters of any case.
std::optional<Form> FormOf(const std::string& path)
{
    const CString name = FromUtf8(path);
    for (const auto& [extension, form] : kForms) {
        const CString wanted = FromUtf8(extension);
        const int start = name.GetLength() - wanted.GetLength();
        if (start >= 0 &&
            wanted.CompareNoCase(name.View().substr(static_cast<std::size_t>(start))) == 0)
            return form;
    }
    return std::nullopt;
}

/// What is carried over.
struct Content
{
    CString comment;
    std::vector<Parameter> parameters;
    /// Whether all of the file is in it.
    bool whole = true;
};

bool BeginsLikeJson(const InputFile& file)
{
    try {
        CFile bytes(file.Path(), CFile::modeRead);
        std::array<char, 64> start;
        const std::string_view text(start.data(),
                                    bytes.Read(start.data(), static_cast<UINT>(start.size())));
        const std::size_t first = text.find_first_not_of("\xEF\xBB\xBF \t\r\n");
        return first != text.npos && text[first] == '{';
    } catch (const CFileException&) {
        // The import says what is wrong with the file.
        return false;
    }
}

Content ContentOfDcm(const InputFile& file)
{
    Input input = ReadInput(file);
    TellErrors(input);
    if (!input.complete)
        throw Trouble(Shown(input.label) + ": the import ended early; nothing is written");
    const CString comment = input.document.GetComment();
    return {comment, ParametersOf(std::move(input.document)),
            input.report.Count(Severity::kError) == 0};
}

Content ContentOf(const ConvertOptions& options)
{
    if (FormOf(options.file) == Form::kCsv)
        throw Trouble(Shown(options.file) + ": CSV cannot be read, only written");
    Progress progress(1);
    progress.Begin(options.file);
    const InputFile file(options.file);
    if (FormOf(options.file) != Form::kJson && !BeginsLikeJson(file))
        return ContentOfDcm(file);
    JsonDocument document = ReadJson(file.Content(), file.Label());
    return {std::move(document.comment), std::move(document.parameters), true};
}

/// Returns whether the file holds all of the content.
bool WriteDcm(Content&& content, const std::string& out)
{
    const DCMConverter document = DocumentOf(std::move(content.parameters), content.comment);
    const Report report = ReportOfExport(document, kFindingsPerId);
    for (const Finding& finding : report.Findings()) {
        if (finding.severity != Severity::kNote)
            Complain(FindingText(out, finding, Plain));
    }
    SaveFile(document, out);
    return report.Count(Severity::kError) == 0;
}

CsvStyle StyleOf(const ConvertOptions& options)
{
    const char usual = options.decimalComma ? ';' : ',';
    if (options.separator.empty())
        return {usual, options.decimalComma};
    if (options.separator == "tab")
        return {'\t', options.decimalComma};
    const char separator = options.separator.front();
    if (options.separator.size() > 1 || separator == '"' || separator == '\r' ||
        separator == '\n' || static_cast<unsigned char>(separator) >= 0x80)
        throw Trouble("the separator must be one character such as ; or the word tab");
    return {separator, options.decimalComma};
}

} // namespace

int Convert(const ConvertOptions& options)
{
    const auto form = FormOf(options.out);
    if (!form)
        throw Trouble(Shown(options.out) + ": the name must end in .dcm, .json or .csv");
    if (form != Form::kCsv && (!options.separator.empty() || options.decimalComma))
        throw Trouble("--separator and --decimal-comma are for .csv alone");
    const CsvStyle style = StyleOf(options);

    Content content = ContentOf(options);
    bool whole = content.whole;
    if (form == Form::kDcm) {
        whole &= WriteDcm(std::move(content), options.out);
    } else if (form == Form::kJson) {
        WriteWholeFile(options.out, JsonText(content.comment, content.parameters));
    } else {
        WriteWholeFile(options.out, CsvText(content.parameters, style));
    }
    return whole ? 0 : 1;
}

} // namespace dcm::tools
