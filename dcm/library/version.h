#pragma once

#include "dcm/library/export.h"

// The version of these headers; versions of one major number are compatible.
#define DCM_VERSION_MAJOR 1
#define DCM_VERSION_MINOR 0
#define DCM_VERSION_PATCH 0

namespace dcm {

/// The version of the library that runs, such as "1.0.0", which may be another than that of
/// the headers the host was compiled with. The text is never released.
DCM_API const char* LibraryVersion() noexcept;

} // namespace dcm
