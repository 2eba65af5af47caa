#pragma once

#include "dcm/library/dcm.h"

#include <string>
#include <vector>

namespace dcm::tools {

/// A comparison from the words of a command line: tolerances such as "1e-6" and "0.1%"; what is
/// left out, of "texts", "units" and "axes". Throws `Trouble` for a tolerance that is none.
Comparison ComparisonOf(const std::vector<std::string>& tolerances,
                        const std::vector<std::string>& ignored);

} // namespace dcm::tools
