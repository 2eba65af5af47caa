#pragma once

#include "dcm/library/dcm.h"
#include "tools/output.h"

#include <array>
#include <string>
#include <string_view>

/// @file
/// Findings as compilers write them.

namespace dcm::tools {

/// All severities.
inline constexpr std::array kSeverities = {Severity::kNote, Severity::kWarning, Severity::kError};

/// "FILE:LINE: warning: message [id]", without the line when the finding concerns none. `paint`
/// colours its parts.
std::string FindingText(std::string_view file, const Finding& finding,
                        std::string (*paint)(std::string_view, Colour));

} // namespace dcm::tools
