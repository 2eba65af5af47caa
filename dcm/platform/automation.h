#pragma once

// Result codes, variants and their texts: on Windows the system's own, on Linux the same names
// with the same meaning.
#ifdef _WIN32
#include "dcm/platform/windows/automation.h"
#elif defined(__linux__)
#include "dcm/platform/linux/automation.h"
#else
#error "dcm is for Linux and Windows."
#endif
