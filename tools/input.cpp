#include "tools/input.h"

#include "tools/output.h"
#include "tools/shown_text.h"
#include "tools/trouble.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <limits>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace dcm::tools {

namespace {

constexpr std::string_view kStandardInput = "-";

/// Findings after which nothing of a file is there.
constexpr std::array<std::string_view, 3> kNothingRead = {"cannot-open", "cannot-read",
                                                          "out-of-memory"};

/// The path is in the label already, and that of a copy tells nothing.
std::string WithoutPath(std::string words, const InputFile& file)
{
    const std::string path = ToUtf8(file.Path().View()) + ": ";
    const std::size_t at = words.find(path);
    return at == words.npos ? words : words.erase(at, path.size());
}

[[noreturn]] void ThrowNothingRead(const InputFile& file, const Report& report)
{
    const std::string label = Shown(file.Label()) + ": ";
    for (const Finding& finding : report.Findings()) {
        if (std::find(kNothingRead.begin(), kNothingRead.end(), finding.id) != kNothingRead.end())
            throw Trouble(label + Shown(WithoutPath(ToUtf8(finding.message.View()), file)));
    }
    throw Trouble(label + "cannot read the file");
}

bool CannotRead(const Report& report)
{
    return std::any_of(kNothingRead.begin(), kNothingRead.end(),
                       [&report](std::string_view id) { return report.Count(id) > 0; });
}

bool HasBlocks(const DCMConverter& document)
{
    bool has = false;
    ForEach(document, [&has](const auto&) { has = true; });
    return has;
}

/// Whether a line begins with the keyword of a block or of the version.
bool IsKnownLine(std::wstring_view line)
{
    const std::wstring_view keyword = line.substr(0, line.find(L' '));
    return KindOf(keyword) || CString(keyword).CompareNoCase(L"KONSERVIERUNG_FORMAT") == 0;
}

bool HasKnownLine(const CString& path)
{
    PravFile file;
    CString line;
    if (file.Open(path, CFile::modeRead) == FALSE)
        return false;
    while (file.ReadLine(line) != FALSE) {
        if (IsKnownLine(line.View()))
            return true;
    }
    return false;
}

} // namespace

InputFile::InputFile(const std::string& argument)
    : m_label(argument == kStandardInput ? "<stdin>" : argument),
      m_copy(argument == kStandardInput ? std::make_unique<InputCopy>() : nullptr)
{}

std::string InputFile::Content() const
{
    try {
        CFile file(Path(), CFile::modeRead);
        std::string content(static_cast<std::size_t>(file.GetLength()), '\0');
        content.resize(file.Read(content.data(), static_cast<UINT>(content.size())));
        return content;
    } catch (const CFileException& error) {
        throw Trouble(Shown(m_label) + ": " + Shown(WithoutPath(error.what(), *this)));
    }
}

Input ReadInput(const InputFile& file, std::size_t limit)
{
    Input input;
    input.label = file.Label();
    input.report.SetLimit(limit);
    const CString path = file.Path();
    input.complete = SUCCEEDED(Import(input.document, path, input.report));
    if (CannotRead(input.report))
        ThrowNothingRead(file, input.report);
    if (!HasBlocks(input.document) && !HasKnownLine(path)) {
        throw Trouble(Shown(input.label) +
                      ": not a DCM file: it has neither a known block nor a version line");
    }
    if (input.report.Count("looks-like-utf-8") > 0)
        Complain(Shown(input.label) + ": looks like UTF-8; read it with --code-page utf-8");
    return input;
}

Input ReadInput(const std::string& argument, Progress& progress, std::size_t limit)
{
    progress.Begin(argument == kStandardInput ? "<stdin>" : argument);
    Input input = ReadInput(InputFile(argument), limit);
    progress.Pause();
    return input;
}

std::size_t ErrorsOf(const Input& input)
{
    return input.report.Count(Severity::kError);
}

void TellErrors(const Input& input)
{
    if (const std::size_t errors = ErrorsOf(input)) {
        Complain(Shown(input.label) + ": " + Counted(errors, "error") + "; dcm check shows " +
                 (errors == 1 ? "it" : "them"));
    }
}

void RequireOneStandardInput(const std::vector<std::string>& arguments)
{
    if (std::count(arguments.begin(), arguments.end(), kStandardInput) > 1)
        throw Trouble("only one file can be the standard input");
}

} // namespace dcm::tools
