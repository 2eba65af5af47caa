#pragma once

#include "dcm/library/dcm.h"

#include <span>
#include <string>

namespace dcm::tools {

/// How a table for spreadsheets is written.
struct CsvStyle
{
    char separator = ',';
    bool decimalComma = false;
};

/// One row a value: name, kind, x, y, value, units. UTF-8 with a byte-order mark, lines ended by
/// CR LF. A parameter without values has one row; a distribution has its points under x.
std::string CsvText(std::span<const Parameter> parameters, const CsvStyle& style);

} // namespace dcm::tools
