#pragma once

#include "dcm/platform/cstring.h"

#include <string>

#include <sys/mman.h>

/// The path of a file in memory, so that a target is not slowed down by the disk.
inline const CString& MemoryFile()
{
    static const CString path(L"/proc/self/fd/" + std::to_wstring(memfd_create("dcm", 0)));
    return path;
}
