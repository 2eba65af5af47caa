#pragma once

#include "dcm/platform/cfile.h"
#include "dcm/platform/cstring.h"
#include "dcm/platform/system_file.h"

namespace dcm {

namespace system {

/// A file that is about to be replaced, and the new file beside it.
struct Replacement
{
    /// The file itself, where the given path is a link to it.
    CString target;
    /// The new file; empty while there is none.
    CString file;
    /// The target, in use by nobody else; `kNoFile` where there is none yet.
    FileHandle held = kNoFile;
    /// Whether the path is a device, which is written directly.
    bool device = false;
};

/// Follows the links of `path` to the target and makes sure that it may be written and that nobody
/// has it open. Returns an error number, or sets `refusal`, as `OpenFile` does.
long FindTarget(const CString& path, Replacement& replacement, CFileException::Cause& refusal);
/// The folder of the target, up to its last separator, which may be empty.
CString FolderOf(const CString& target);
/// Creates the empty file `path`, which must not exist, with the mode of the target if there is
/// one.
long CreateBeside(const CString& path, const Replacement& replacement);
/// Writes the new file through to the disk, replaces the target by it and closes the target.
long TakePlace(Replacement& replacement);
/// Closes the target and removes the new file, if there still is one. Ignores errors.
void Abandon(Replacement& replacement) noexcept;

} // namespace system

/// A new file that takes the place of another in one step: whatever happens, the path leads to
/// either the old file or the new one, whole. All failures are thrown as `CFileException` with the
/// given path.
class ReplacementFile
{
public:
    /// Creates an empty file beside the one that `path` leads to, which nobody else may have open
    /// from now on where the system can ensure it. A folder, a pipe or a file that may not be
    /// written is refused.
    explicit ReplacementFile(const CString& path);
    ReplacementFile(const ReplacementFile&) = delete;
    ReplacementFile& operator=(const ReplacementFile&) = delete;
    /// Removes the new file unless it has taken its place.
    ~ReplacementFile();

    /// Where to write: the new file, or the given path if that is a device.
    const CString& Path() const { return m_replacement.device ? m_path : m_replacement.file; }
    /// Replaces the old file by the new one, which must be closed.
    void TakePlace();

private:
    void Check(long error, CFileException::Cause refusal) const;

    CString m_path;
    system::Replacement m_replacement;
};

} // namespace dcm
