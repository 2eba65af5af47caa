// report FILE [OTHER] -o PAGE
// Makes the page of a file, or of two with their differences.
#include "dcm/library/dcm.h"
#include "tools/report/page.h"

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

namespace {

/// A file as the page needs it.
struct File
{
    dcm::Report report;
    CString comment;
    std::vector<dcm::Parameter> parameters;
    CString title;

    bool Read(const std::string& path)
    {
        DCMConverter document;
        const HRESULT result = dcm::Import(document, dcm::FromUtf8(path), report);
        comment = document.GetComment();
        parameters = dcm::ParametersOf(document);
        title = dcm::FromUtf8(std::filesystem::path(path).filename().string());
        return SUCCEEDED(result);
    }
    dcm::tools::PageFile Shown() const { return {title, comment, parameters, &report}; }
};

} // namespace

int main(int argc, char** argv)
{
    if (argc < 4 || argc > 5 || argv[argc - 2] != std::string("-o")) {
        std::fprintf(stderr, "usage: report FILE [OTHER] -o PAGE\n");
        return 2;
    }
    File files[2];
    for (int i = 0; i < argc - 3; ++i)
        if (!files[i].Read(argv[i + 1])) {
            std::fprintf(stderr, "report: cannot read %s\n", argv[i + 1]);
            return 2;
        }
    std::ofstream out(argv[argc - 1], std::ios::binary);
    if (argc == 4)
        dcm::tools::WritePage(out, files[0].Shown());
    else
        dcm::tools::WritePage(out, files[0].Shown(), files[1].Shown(),
                              dcm::Differences(files[0].parameters, files[1].parameters));
    out.close();
    if (!out) {
        std::fprintf(stderr, "report: cannot write %s\n", argv[argc - 1]);
        return 2;
    }
}
