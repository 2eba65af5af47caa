#pragma once

#include "dcm/platform/cstring.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
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
        std::ofstream(std::filesystem::path(m_path), std::ios::binary) << bytes;
    }

    std::string Bytes() const
    {
        std::ifstream file(std::filesystem::path(m_path), std::ios::binary);
        return std::string(std::istreambuf_iterator<char>(file), {});
    }

private:
    int m_file;
    std::wstring m_path;
};
