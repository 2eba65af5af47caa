#pragma once

#include <string>

namespace dcm::tools {

struct ReportOptions
{
    std::string file;
    /// A second file to compare with; empty for none.
    std::string other;
    std::string out;
};

/// Writes the page of a file, or of two. Returns the exit code.
int MakeReport(const ReportOptions& options);

} // namespace dcm::tools
