#pragma once

// The system's own variants, texts and result codes. The rest of its header is left out, and so are
// its macros `min` and `max`, unless the host has included it before. Neither choice holds for
// headers that come after.
#ifndef WIN32_LEAN_AND_MEAN
#define WIN32_LEAN_AND_MEAN
#define DCM_DEFINED_LEAN_AND_MEAN
#endif
#ifndef NOMINMAX
#define NOMINMAX
#define DCM_DEFINED_NOMINMAX
#endif

#include <windows.h>

#include <oleauto.h>

#ifdef DCM_DEFINED_LEAN_AND_MEAN
#undef DCM_DEFINED_LEAN_AND_MEAN
#undef WIN32_LEAN_AND_MEAN
#endif
#ifdef DCM_DEFINED_NOMINMAX
#undef DCM_DEFINED_NOMINMAX
#undef NOMINMAX
#endif
