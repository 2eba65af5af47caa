#pragma once

#include <string>
#include <string_view>
#include <vector>

/// @file
/// What the program asks of the system; each system has one source file.

namespace dcm::tools {

/// The whole program: takes the arguments in UTF-8, without the name of the program, and returns
/// the exit code. The system's entry point calls it.
int Run(std::vector<std::string> arguments);

enum class Stream
{
    kOutput,
    kError,
};

/// Whether the stream is shown to a person as it is written.
bool IsTerminal(Stream stream);

/// Makes the streams take bytes as they are, and a terminal understand UTF-8 and colours.
void PrepareStreams();

/// A copy of the standard input in a file that only this user can read. It is removed with this
/// object, and when the program is interrupted.
class InputCopy
{
public:
    /// Reads the standard input to its end. Throws `Trouble` when that fails.
    InputCopy();
    InputCopy(const InputCopy&) = delete;
    InputCopy& operator=(const InputCopy&) = delete;
    ~InputCopy();

    /// The path by which the file can be opened while this object lives.
    const std::string& Path() const { return m_path; }

private:
    void Copy() const;

    std::string m_path;
    int m_file = -1;
};

/// Holds an interrupt back (Ctrl-C, a request to end) while a file is written. It takes effect
/// when this object is destroyed.
class HoldInterrupts
{
public:
    HoldInterrupts();
    HoldInterrupts(const HoldInterrupts&) = delete;
    HoldInterrupts& operator=(const HoldInterrupts&) = delete;
    ~HoldInterrupts();
};

/// Writes a new file beside the one at `path` and renames it, so that the old file is whole until
/// the new one is. A link is followed. Where the path is no regular file, such as a device, it is
/// written directly. Throws `Trouble`, with the old file as it was, when that fails.
void WriteWholeFile(const std::string& path, std::string_view content);

} // namespace dcm::tools
