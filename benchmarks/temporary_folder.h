#pragma once

#include <cstdint>
#include <filesystem>
#include <random>
#include <string>

namespace dcm::bench {

/// A new folder, in memory if the system can. The destructor removes it.
class TemporaryFolder
{
public:
    TemporaryFolder()
    {
        const std::filesystem::path memory = "/dev/shm";
        const auto parent =
            std::filesystem::is_directory(memory) ? memory : std::filesystem::temp_directory_path();
        do {
            m_path = parent / ("dcm-benchmark-" + std::to_string(std::random_device{}()));
        } while (!std::filesystem::create_directory(m_path));
    }
    TemporaryFolder(const TemporaryFolder&) = delete;
    TemporaryFolder& operator=(const TemporaryFolder&) = delete;
    ~TemporaryFolder()
    {
        std::error_code ignored;
        std::filesystem::remove_all(m_path, ignored);
    }

    const std::filesystem::path& Path() const { return m_path; }

private:
    std::filesystem::path m_path;
};

} // namespace dcm::bench
