#pragma once

#include <string>

namespace dcm::tools {

struct ConvertOptions
{
    std::string file;
    std::string out;
    /// A character or "tab"; empty for the usual one. For CSV alone.
    std::string separator;
    bool decimalComma = false;
};

/// Writes a DCM file or one in JSON in the form that the name of the new file asks for. Returns the
/// exit code.
int Convert(const ConvertOptions& options);

} // namespace dcm::tools
