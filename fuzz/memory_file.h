#pragma once

#include "dcm/platform/cstring.h"

#include <cstdlib>
#include <string>
#include <string_view>

#include <sys/mman.h>
#include <unistd.h>

/// A file in memory, so that a target is not slowed down by the disk.
class MemoryFile
{
public:
    MemoryFile()
        : m_file(memfd_create("dcm", MFD_CLOEXEC)),
          m_path(L"/proc/self/fd/" + std::to_wstring(m_file))
    {
        if (m_file < 0)
            std::abort();
    }
    MemoryFile(const MemoryFile&) = delete;
    MemoryFile& operator=(const MemoryFile&) = delete;
    ~MemoryFile() { close(m_file); }

    CString Path() const { return CString(m_path); }

    void SetBytes(std::string_view bytes)
    {
        if (ftruncate(m_file, 0) != 0 ||
            pwrite(m_file, bytes.data(), bytes.size(), 0) != static_cast<ssize_t>(bytes.size()))
            std::abort();
    }

    std::string Bytes() const
    {
        std::string bytes(static_cast<std::size_t>(lseek(m_file, 0, SEEK_END)), '\0');
        if (pread(m_file, bytes.data(), bytes.size(), 0) != static_cast<ssize_t>(bytes.size()))
            std::abort();
        return bytes;
    }

private:
    int m_file;
    std::wstring m_path;
};
