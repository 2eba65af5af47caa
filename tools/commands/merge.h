#pragma once

#include <string>
#include <vector>

namespace dcm::tools {

struct MergeOptions
{
    std::string base;
    std::vector<std::string> changes;
    std::string out;
    /// Patterns for the names of the blocks that are taken from the changes; none for all.
    std::vector<std::string> only;
    /// Patterns for the names that are not taken.
    std::vector<std::string> excluded;
    bool force = false;
};

/// Writes the blocks of one file with those of others in their place or after them. Returns the
/// exit code.
int Merge(const MergeOptions& options);

} // namespace dcm::tools
