#pragma once

#include <string_view>

namespace dcm::system {

/// The path of the device that accepts all that is written to it and keeps nothing.
extern const std::wstring_view kNullDevice;

} // namespace dcm::system
