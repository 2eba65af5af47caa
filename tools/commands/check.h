#pragma once

#include "dcm/library/dcm.h"

#include <cstddef>
#include <string>
#include <vector>

namespace dcm::tools {

struct CheckOptions
{
    std::vector<std::string> files;
    /// The exit code is 1 from this severity on.
    Severity failOn = Severity::kWarning;
    /// How many findings of one id are listed.
    std::size_t limit = 1000;
    bool json = false;
};

/// Lists every finding of importing files and of writing them again. Returns the exit code.
int Check(const CheckOptions& options);

} // namespace dcm::tools
