#pragma once

#include "dcm/library/dcm.h"

#include <cstddef>
#include <string>

/// @file
/// Parts of a parameter as a person reads them.

namespace dcm::tools {

/// A number, a text in double quotes, "-" for no value.
std::string ValueText(const VARIANT& value);

/// "KENNFELD Name".
std::string TitleOf(const Parameter& parameter);

/// "8 x 6" for a map or a block in rows, otherwise the number of values or points.
std::string SizeText(const Parameter& parameter);

/// All values in one short text: the value, the least and the greatest number, or the first text.
std::string ValuesText(const Parameter& parameter);

/// What the place of a value in a parameter is called.
struct Coordinates
{
    /// An axis point, or the index in the row as a number; empty when there is neither.
    CComVariant x;
    /// The same for the row; empty when there is one row only.
    CComVariant y;
};

/// Where the value with this index is.
Coordinates CoordinatesOf(const Parameter& parameter, std::size_t index);

} // namespace dcm::tools
