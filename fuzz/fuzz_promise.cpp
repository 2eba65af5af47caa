// Nothing is lost in silence: when neither the import of a file nor the export of its parameters
// reports a warning or an error, the exported file says all that the first one said. And what an
// export reports clean, an import of that file reports clean.

#include "fuzz/file_content.h"
#include "fuzz/file_maker.h"
#include "fuzz/target.h"

#include "dcm/library/dcm.h"

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <string>

namespace {

bool IsClean(const dcm::Report& report)
{
    return report.Count(dcm::Severity::kWarning) == 0 && report.Count(dcm::Severity::kError) == 0;
}

void Print(const char* what, const dcm::Report& report)
{
    std::fprintf(stderr, "%s: %s\n", what, dcm::ToUtf8(report.Summary()).c_str());
    for (const dcm::Finding& finding : report.Findings()) {
        std::fprintf(stderr, "  %lld: %s [%s]\n", static_cast<long long>(finding.line),
                     dcm::ToUtf8(finding.message).c_str(), std::string(finding.id).c_str());
    }
}

/// Findings are in the order of their lines, and within the bounds that are promised.
void RequireSound(const dcm::Report& report, HRESULT result)
{
    std::size_t listed = 0;
    std::int64_t line = 1;
    for (const dcm::Finding& finding : report.Findings()) {
        ++listed;
        Require(finding.line == 0 || finding.line >= line, "findings are in order");
        line = finding.line == 0 ? INT64_MAX : finding.line;
        Require(!finding.id.empty() && !finding.message.IsEmpty(), "a finding says something");
        Require(finding.message.GetLength() < 600, "a message is short");
    }
    Require(report.Incomplete() || listed == report.Count(), "all findings are listed");
    Require(SUCCEEDED(result) || report.Count(dcm::Severity::kError) > 0, "a failure has a cause");
}

} // namespace

extern "C" std::size_t LLVMFuzzerMutate(std::uint8_t* data, std::size_t size, std::size_t room);
extern "C" std::size_t LLVMFuzzerCustomMutator(std::uint8_t* data, std::size_t size,
                                               std::size_t room, unsigned seed);

/// Makes new files and changes whole lines as often as single bytes: a file that is read without a
/// finding is rare among bytes.
extern "C" std::size_t LLVMFuzzerCustomMutator(std::uint8_t* data, std::size_t size,
                                               std::size_t room, unsigned seed)
{
    fuzz::Random random(seed);
    const std::size_t way = random() % 4;
    if (way == 0)
        return LLVMFuzzerMutate(data, size, room);
    std::string text =
        way == 1 ? std::string(reinterpret_cast<const char*>(data), size) : fuzz::MakeFile(random);
    for (std::size_t changes = random() % 3; changes > 0; --changes)
        fuzz::ChangeALine(text, random);
    size = std::min(text.size(), room);
    std::memcpy(data, text.data(), size);
    return size;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const CString& file = MemoryFile();
    // A control character in front chooses UTF-8.
    const bool utf8 = size > 0 && *data == 1;
    Require(dcm::SetThreadCodePage(utf8 ? 65001 : 1252), "the code page is known");
    const std::string before(reinterpret_cast<const char*>(data) + (utf8 ? 1 : 0),
                             size - (utf8 ? 1 : 0));
    std::ofstream(test::PathOf(file), std::ios::binary) << before;

    DCMConverter document, plain;
    dcm::Report imported, exported, again;
    const HRESULT result = dcm::Import(document, file, imported);
    RequireSound(imported, result);
    Require(result == plain.Import(file), "a report changes no result");
    Require(test::ExportBytes(document, file) == test::ExportBytes(plain, file),
            "a report changes no document");

    DCMConverter copy;
    for (const dcm::Parameter& parameter : dcm::ParametersOf(document))
        dcm::Add(copy, parameter);
    const HRESULT written = dcm::Export(copy, file, exported);
    Require(written == S_OK, "an export succeeds");
    RequireSound(exported, written);
    const std::string after = test::ReadBytes(file);

    DCMConverter third;
    Require(dcm::Import(third, file, again) == S_OK, "an exported file is read");
    if (IsClean(exported) && !IsClean(again)) {
        Print("export", exported);
        Print("import of it", again);
        Require(false, "what an export reports clean, an import reports clean");
    }
    if (IsClean(imported) && IsClean(exported)) {
        const auto said = fuzz::ContentOf(before);
        const auto kept = fuzz::ContentOf(after);
        if (!fuzz::SayTheSame(said, kept)) {
            Print("import", imported);
            Print("export", exported);
            std::fprintf(stderr, "said:\n%s\nkept:\n%s\n", fuzz::Describe(said).c_str(),
                         fuzz::Describe(kept).c_str());
            Require(false, "a clean file loses nothing");
        }
    }
    return 0;
}
