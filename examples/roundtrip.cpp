// roundtrip IN.dcm [OUT.dcm]
// Prints what is in a DCM file, in UTF-8, and writes it again with its comment and the names of the
// axes that blocks share. What it cannot read or keep is reported on standard error.
#include "dcm/library/dcm.h"

#include <algorithm>
#include <charconv>
#include <cstdio>
#include <iterator>
#include <string>
#include <vector>

namespace {

std::string TextOf(const CComVariant& value)
{
    if (value.vt == VT_BSTR)
        return '"' + dcm::ToUtf8(CComVariant::TextOf(value)) + '"';
    if (value.vt != VT_R8)
        return "-";
    char digits[32];
    return {digits, std::to_chars(digits, std::end(digits), value.dblVal).ptr};
}

/// Prints name, unit and first values of a parameter or points of a distribution.
void Print(const dcm::Parameter& parameter)
{
    const bool isAxis = parameter.kind == dcm::Kind::kStuetzstellenverteilung;
    const std::vector<CComVariant>& values = isAxis ? parameter.x.points : parameter.values;
    const CString& unit = isAxis ? parameter.x.unit : parameter.unit;
    std::string line = "  " + dcm::ToUtf8(parameter.name);
    if (!unit.IsEmpty())
        line += " [" + dcm::ToUtf8(unit) + "]";
    constexpr std::size_t kMostShown = 6;
    for (std::size_t i = 0; i < std::min(values.size(), kMostShown); ++i)
        line += "  " + TextOf(values[i]);
    if (values.size() > kMostShown)
        line += "  ... (" + std::to_string(values.size()) + ")";
    std::printf("%s\n", line.c_str());
}

/// Prints the findings of an import or export, and returns whether it succeeded.
bool Succeeded(HRESULT result, const char* path, const dcm::Report& report)
{
    for (const dcm::Finding& finding : report.Findings()) {
        std::fprintf(stderr, "%s:%lld: %s: %s\n", path, static_cast<long long>(finding.line),
                     dcm::ToUtf8(dcm::NameOf(finding.severity)).c_str(),
                     dcm::ToUtf8(finding.message).c_str());
    }
    return SUCCEEDED(result);
}

} // namespace

int main(int argc, char** argv)
{
    if (argc != 2 && argc != 3) {
        std::fprintf(stderr, "usage: roundtrip IN.dcm [OUT.dcm]\n");
        return 2;
    }

    DCMConverter document;
    dcm::Report report;
    if (!Succeeded(dcm::Import(document, dcm::FromUtf8(argv[1]), report), argv[1], report))
        return 1;

    std::printf("%s", dcm::ToUtf8(document.GetComment()).c_str());
    DCMConverter written;
    written.SetHeader(dcm::HeaderOfComment(document.GetComment()));
    const std::vector<dcm::Parameter> parameters = dcm::ParametersOf(document);
    for (const dcm::Kind kind : dcm::kKinds) {
        std::printf("\n%s\n", dcm::ToUtf8(dcm::KeywordOf(kind)).c_str());
        for (const dcm::Parameter& parameter : parameters) {
            if (parameter.kind == kind) {
                Print(parameter);
                dcm::Add(written, parameter);
            }
        }
    }

    if (argc == 3 &&
        !Succeeded(dcm::Save(written, dcm::FromUtf8(argv[2]), report), argv[2], report))
        return 1;
}
