#include "tools/system/system.h"

#include "tools/trouble.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace dcm::tools {

namespace {

/// What the system says of its last error.
std::string SystemWords()
{
    return std::strerror(errno);
}

/// Writes all of `content`; false, with `errno`, when that fails.
bool WriteAll(int file, std::string_view content)
{
    while (!content.empty()) {
        const ssize_t written = write(file, content.data(), content.size());
        if (written < 0 && errno == EINTR)
            continue;
        if (written < 0)
            return false;
        content.remove_prefix(static_cast<std::size_t>(written));
    }
    return true;
}

/// Ends the program's use of a file descriptor.
class Descriptor
{
public:
    explicit Descriptor(int file) : m_file(file) {}
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;
    ~Descriptor()
    {
        if (m_file >= 0)
            close(m_file);
    }

    int Get() const { return m_file; }
    /// Closes now and tells whether all of the file has been stored.
    bool Close()
    {
        const int file = m_file;
        m_file = -1;
        return close(file) == 0;
    }

private:
    int m_file;
};

/// The mode of the file at `path`, or the one that a new file gets.
mode_t ModeFor(const struct stat* existing)
{
    if (existing != nullptr)
        return existing->st_mode & 07777U;
    const mode_t mask = umask(0);
    umask(mask);
    return 0666U & ~mask;
}

/// The path that a link leads to; the path itself when it is none or leads nowhere.
std::string FollowLink(const std::string& path)
{
    const std::unique_ptr<char, decltype(&std::free)> real(realpath(path.c_str(), nullptr),
                                                           &std::free);
    return real ? std::string(real.get()) : path;
}

void WriteDirectly(const std::string& path, std::string_view content)
{
    Descriptor file(open(path.c_str(), O_WRONLY | O_CLOEXEC));
    if (file.Get() < 0 || !WriteAll(file.Get(), content) || !file.Close())
        throw Trouble(path + ": cannot write: " + SystemWords());
}

} // namespace

bool IsTerminal(Stream stream)
{
    return isatty(stream == Stream::kOutput ? STDOUT_FILENO : STDERR_FILENO) != 0;
}

void PrepareStreams()
{}

InputCopy::InputCopy()
{
    const char* const folder = std::getenv("TMPDIR");
    std::string name = std::string(folder != nullptr && *folder != '\0' ? folder : "/tmp");
    name += "/dcm-XXXXXX";
    m_file = mkostemp(name.data(), O_CLOEXEC);
    if (m_file < 0)
        throw Trouble(name + ": cannot create: " + SystemWords());
    // Without a name the file vanishes with the program, however it ends.
    unlink(name.c_str());
    m_path = "/dev/fd/" + std::to_string(m_file);
    try {
        Copy();
    } catch (...) {
        close(m_file);
        throw;
    }
}

void InputCopy::Copy() const
{
    std::array<char, 65536> buffer;
    for (;;) {
        const ssize_t count = read(STDIN_FILENO, buffer.data(), buffer.size());
        if (count < 0 && errno == EINTR)
            continue;
        if (count < 0)
            throw Trouble("<stdin>: cannot read: " + SystemWords());
        if (count == 0)
            return;
        if (!WriteAll(m_file, {buffer.data(), static_cast<std::size_t>(count)}))
            throw Trouble("<stdin>: cannot keep a copy: " + SystemWords());
    }
}

InputCopy::~InputCopy()
{
    close(m_file);
}

namespace {

sigset_t Interrupts()
{
    sigset_t signals;
    sigemptyset(&signals);
    for (const int signal : {SIGINT, SIGTERM, SIGHUP})
        sigaddset(&signals, signal);
    return signals;
}

} // namespace

HoldInterrupts::HoldInterrupts()
{
    const sigset_t signals = Interrupts();
    pthread_sigmask(SIG_BLOCK, &signals, nullptr);
}

HoldInterrupts::~HoldInterrupts()
{
    const sigset_t signals = Interrupts();
    pthread_sigmask(SIG_UNBLOCK, &signals, nullptr);
}

void WriteWholeFile(const std::string& path, std::string_view content)
{
    const HoldInterrupts hold;
    const std::string target = FollowLink(path);
    struct stat status = {};
    const bool exists = stat(target.c_str(), &status) == 0;
    if (exists && S_ISDIR(status.st_mode))
        throw Trouble(path + ": cannot write: it is a folder");
    if (exists && !S_ISREG(status.st_mode)) {
        WriteDirectly(target, content);
        return;
    }
    if (exists && access(target.c_str(), W_OK) != 0)
        throw Trouble(path + ": cannot write: " + SystemWords());

    std::string name = target + ".XXXXXX";
    Descriptor file(mkostemp(name.data(), O_CLOEXEC));
    if (file.Get() < 0)
        throw Trouble(path + ": cannot create: " + SystemWords());
    if (fchmod(file.Get(), ModeFor(exists ? &status : nullptr)) != 0 ||
        !WriteAll(file.Get(), content) || fsync(file.Get()) != 0 || !file.Close() ||
        rename(name.c_str(), target.c_str()) != 0) {
        const std::string words = SystemWords();
        unlink(name.c_str());
        throw Trouble(path + ": cannot write: " + words);
    }
}

} // namespace dcm::tools
