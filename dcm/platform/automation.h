#pragma once

// Result codes, variants and their texts: the system's own on Windows, the same names with the
// same meaning elsewhere.
#ifdef _WIN32
#include "dcm/platform/windows/automation.h"
#else
#include "dcm/platform/linux/automation.h"
#endif
