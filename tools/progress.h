#pragma once

#include <condition_variable>
#include <cstddef>
#include <mutex>
#include <string>
#include <string_view>
#include <thread>

namespace dcm::tools {

/// Tells on a terminal, once a second has passed, which file the work is at and how many are done.
/// Where the standard error is no terminal it does nothing.
class Progress
{
public:
    /// For so many files.
    explicit Progress(std::size_t files);
    Progress(const Progress&) = delete;
    Progress& operator=(const Progress&) = delete;
    ~Progress();

    /// The work on the next file begins.
    void Begin(std::string_view file);
    /// No file is worked on: what was told is wiped away, so that other text can be written.
    void Pause();

private:
    void Watch();

    const std::size_t m_files;
    const bool m_isTerminal;
    std::mutex m_mutex;
    std::condition_variable m_changed;
    std::string m_file;
    std::size_t m_begun = 0;
    bool m_working = false;
    bool m_told = false;
    bool m_ended = false;
    std::thread m_watcher;
};

} // namespace dcm::tools
