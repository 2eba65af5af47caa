#pragma once

#include <string>
#include <vector>

namespace dcm::tools {

struct ShowOptions
{
    std::string file;
    /// Names and patterns of the parameters to show whole; none for a table of all.
    std::vector<std::string> names;
    bool all = false;
    bool lines = false;
    bool json = false;
};

/// Shows what is in a file. Returns the exit code.
int Show(const ShowOptions& options);

} // namespace dcm::tools
