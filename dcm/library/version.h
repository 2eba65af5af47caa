#pragma once

#include "dcm/library/export.h"

/// @file
/// The version of the library.

/// The version of these headers. Within one major number a host works, without being
/// compiled again, with a library of the same or a later version.
#define DCM_VERSION_MAJOR 1
#define DCM_VERSION_MINOR 0
#define DCM_VERSION_PATCH 0

/// What is the library's own, beside the classes whose names are given.
namespace dcm {

/// The version of the library that runs, such as "1.0.0", which may be another than that of
/// the headers the host was compiled with. The text is never released.
DCM_API const char* LibraryVersion() noexcept;

} // namespace dcm
