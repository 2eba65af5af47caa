#pragma once

#include "tests/support.h"

#include <cstdint>
#include <cstdio>
#include <cstdlib>

#include <sys/mman.h>

/// Runs the target on one input; libFuzzer, or the program that replays files, calls it.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

/// The path of a file in memory, which is faster than one on a disk.
inline const CString& MemoryFile()
{
    static const CString path(L"/proc/self/fd/" + std::to_wstring(memfd_create("dcm", 0)));
    return path;
}

/// Aborts the process unless `holds`.
inline void Require(bool holds, const char* what)
{
    if (holds)
        return;
    std::fprintf(stderr, "does not hold: %s\n", what);
    std::abort();
}
