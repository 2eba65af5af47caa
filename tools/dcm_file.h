#pragma once

#include "dcm/library/dcm.h"

#include <cstddef>
#include <string>
#include <vector>

/// @file
/// Writing DCM files.

namespace dcm::tools {

/// The document that holds the parameters, to be written with the comment at its top.
DCMConverter DocumentOf(std::vector<Parameter> parameters, const CString& comment);

/// What a file of the document would lack.
Report ReportOfExport(const DCMConverter& document, std::size_t limit);

/// Saves the document; a file that is there is whole and old or whole and new. Throws `Trouble`
/// when that fails.
void SaveFile(const DCMConverter& document, const std::string& path);

} // namespace dcm::tools
