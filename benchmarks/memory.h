#pragma once

#include <cstddef>
#include <fstream>
#include <string>

/// The memory of this process, as the system counts it.
namespace dcm::bench {

/// A figure of /proc/self/status such as "VmHWM", in bytes; 0 when the system does not have it.
inline std::size_t MemoryFigure(const std::string& name)
{
    std::ifstream status("/proc/self/status");
    std::string word;
    while (status >> word) {
        std::size_t kilobytes = 0;
        if (word == name + ":" && status >> kilobytes)
            return kilobytes * 1024;
    }
    return 0;
}

/// The most memory that the process has used since its start or since ForgetPeakMemory.
inline std::size_t PeakMemory()
{
    return MemoryFigure("VmHWM");
}

inline std::size_t CurrentMemory()
{
    return MemoryFigure("VmRSS");
}

inline void ForgetPeakMemory()
{
    std::ofstream("/proc/self/clear_refs") << 5;
}

} // namespace dcm::bench
