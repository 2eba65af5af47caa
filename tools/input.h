#pragma once

#include "dcm/library/dcm.h"
#include "tools/progress.h"
#include "tools/system/system.h"

#include <cstddef>
#include <memory>
#include <string>
#include <vector>

/// @file
/// The files that a command reads.

namespace dcm::tools {

/// A path of the command line, `-` for the standard input.
class InputFile
{
public:
    /// Reads the standard input to its end if that is meant. Throws `Trouble`.
    explicit InputFile(const std::string& argument);

    /// What messages call the file: the path as it was given, or "<stdin>".
    const std::string& Label() const { return m_label; }
    /// Where it can be opened.
    CString Path() const { return FromUtf8(m_copy ? m_copy->Path() : m_label); }
    /// All its bytes. Throws `Trouble`.
    std::string Content() const;

private:
    std::string m_label;
    std::unique_ptr<InputCopy> m_copy;
};

/// How many findings of one id a report lists unless a command asks for others.
inline constexpr std::size_t kFindingsPerId = 1000;

/// What a DCM file gave.
struct Input
{
    std::string label;
    DCMConverter document;
    Report report;
    /// Whether the import came to its end; otherwise the document has what was read until then.
    bool complete = false;
};

/// Imports a file. Says it on the standard error when the file looks like UTF-8 and is read as
/// something else. Throws `Trouble` when it cannot be read, or has neither a block of a known kind
/// nor a version line. `limit` is that of the report.
Input ReadInput(const InputFile& file, std::size_t limit = kFindingsPerId);
Input ReadInput(const std::string& argument, Progress& progress,
                std::size_t limit = kFindingsPerId);

/// How many errors the import met.
std::size_t ErrorsOf(const Input& input);

/// Says on the standard error how many errors there are, when there are any.
void TellErrors(const Input& input);

/// Throws `Trouble` when more than one argument is the standard input.
void RequireOneStandardInput(const std::vector<std::string>& arguments);

} // namespace dcm::tools
