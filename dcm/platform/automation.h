#pragma once

// Result codes, variants and their texts: on Windows the system's own, elsewhere the same names
// with the same meaning.
#ifdef _WIN32
#include "dcm/platform/windows/automation.h"
#else
#include "dcm/platform/linux/automation.h"
#endif
