#pragma once

#include "dcm/library/dcm.h"

#include <string>
#include <vector>

namespace dcm::tools {

struct DiffOptions
{
    std::string oldFile;
    std::string newFile;
    /// "1e-6" or "0.1%".
    std::vector<std::string> tolerances;
    /// "texts", "units", "axes".
    std::vector<std::string> ignored;
    bool summary = false;
    bool json = false;
};

/// Shows what two files differ in. Returns the exit code: 0 for no difference, 1 for some.
int Diff(const DiffOptions& options);

} // namespace dcm::tools
