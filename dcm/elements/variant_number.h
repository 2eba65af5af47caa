#pragma once

#include "dcm/platform/automation.h"

#include <optional>

namespace dcm {

/// The number of a value, as a FESTWERT writes it: that of a number of any size, 1.0
/// or 0.0 of a truth value, the days of a date, the units of a currency. None for a text and for
/// any other value.
std::optional<double> NumberOf(const VARIANT& value) noexcept;

} // namespace dcm
