#include "tools/progress.h"

#include "tools/shown_text.h"
#include "tools/system/system.h"

#include <chrono>
#include <cstddef>
#include <cstdio>
#include <mutex>
#include <string>
#include <string_view>
#include <thread>

namespace dcm::tools {

namespace {

constexpr auto kPatience = std::chrono::seconds(1);

/// Replaces what the line of the terminal shows.
void Tell(const std::string& text)
{
    const std::string line = "\r\x1b[K" + text;
    std::fwrite(line.data(), 1, line.size(), stderr);
    std::fflush(stderr);
}

} // namespace

Progress::Progress(std::size_t files) : m_files(files), m_isTerminal(IsTerminal(Stream::kError))
{
    if (m_isTerminal)
        m_watcher = std::thread([this] { Watch(); });
}

Progress::~Progress()
{
    Pause();
    {
        const std::lock_guard lock(m_mutex);
        m_ended = true;
    }
    m_changed.notify_one();
    if (m_watcher.joinable())
        m_watcher.join();
}

void Progress::Begin(std::string_view file)
{
    {
        const std::lock_guard lock(m_mutex);
        m_file = Shown(file);
        ++m_begun;
        m_working = true;
    }
    m_changed.notify_one();
}

void Progress::Pause()
{
    const std::lock_guard lock(m_mutex);
    m_working = false;
    if (m_told)
        Tell("");
    m_told = false;
}

void Progress::Watch()
{
    std::unique_lock lock(m_mutex);
    m_changed.wait_for(lock, kPatience, [this] { return m_ended; });
    while (!m_ended) {
        if (m_working) {
            Tell("reading " + m_file + ", " + std::to_string(m_begun - 1) + " of " +
                 std::to_string(m_files) + " done");
            m_told = true;
        }
        m_changed.wait(lock);
    }
}

} // namespace dcm::tools
