#include "dcm/platform/replacement_file.h"

#include "dcm/platform/codepage.h"
#include "dcm/platform/linux/lock.h"

#include <cerrno>
#include <climits>
#include <cstdio>
#include <fcntl.h>
#include <string>
#include <sys/stat.h>
#include <unistd.h>
#include <utility>

namespace dcm::system {

namespace {

std::string FolderOf(const std::string& path)
{
    const std::size_t slash = path.rfind('/');
    return slash == path.npos ? std::string() : path.substr(0, slash + 1);
}

/// Makes `path` what the link leads to, link after link, whether or not that is there. Returns an
/// error number.
long FollowLinks(std::string& path)
{
    // As many as the system follows.
    constexpr int kLinksMax = 40;
    for (int links = 0; links <= kLinksMax; ++links) {
        std::string next(PATH_MAX, '\0');
        const ssize_t size = readlink(path.c_str(), next.data(), next.size());
        if (size < 0) // EINVAL: not a link.
            return errno == EINVAL || errno == ENOENT ? 0 : errno;
        next.resize(static_cast<std::size_t>(size));
        if (!next.starts_with('/'))
            next.insert(0, FolderOf(path));
        path = std::move(next);
    }
    return ELOOP;
}

/// Writes a file or folder through to the disk.
long Flush(const char* path, int flags)
{
    const int file = open(path, flags | O_CLOEXEC);
    if (file < 0)
        return errno;
    long error = 0;
    while (fsync(file) != 0) {
        if (errno != EINTR) {
            error = errno == EINVAL ? 0 : errno; // EINVAL: there is no such thing for this file.
            break;
        }
    }
    close(file);
    return error;
}

} // namespace

long FindTarget(const CString& path, Replacement& replacement, CFileException::Cause& refusal)
{
    std::string target = ToUtf8(path);
    if (const long error = FollowLinks(target))
        return error;
    replacement.target = FromUtf8(target);
    // A link may lead to a name that no path of a host can be.
    if (ToUtf8(replacement.target) != target) {
        refusal = CFileException::badPath;
        return 0;
    }
    // A pipe without its other end would keep a blocking open waiting.
    const int file = open(target.c_str(), O_WRONLY | O_CLOEXEC | O_NOCTTY | O_NONBLOCK);
    if (file < 0)
        return errno == ENOENT ? 0 : errno;
    replacement.held = file;
    struct stat status = {};
    if (fstat(file, &status) != 0)
        return errno;
    if (S_ISCHR(status.st_mode)) {
        replacement.device = true;
    } else if (!S_ISREG(status.st_mode)) {
        refusal = CFileException::accessDenied;
    } else if (!Lock(file)) {
        refusal = CFileException::sharingViolation;
    }
    return 0;
}

CString FolderOf(const CString& target)
{
    return FromUtf8(FolderOf(ToUtf8(target)));
}

long CreateBeside(const CString& path, const Replacement& replacement)
{
    constexpr mode_t kReadWriteForAll = 0666;
    constexpr mode_t kReadWriteForOwner = 0600;
    const std::string name = ToUtf8(path);
    const bool replaces = replacement.held != kNoFile;
    const int file = open(name.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC,
                          replaces ? kReadWriteForOwner : kReadWriteForAll);
    if (file < 0)
        return errno;
    long error = 0;
    if (replaces) {
        struct stat status = {};
        // Only a privileged process can give a file away; for others it is their own anyway.
        if (fstat(static_cast<int>(replacement.held), &status) != 0 ||
            (fchown(file, status.st_uid, status.st_gid) != 0 && errno != EPERM) ||
            fchmod(file, status.st_mode & ALLPERMS) != 0)
            error = errno;
    }
    close(file);
    if (error != 0)
        unlink(name.c_str());
    return error;
}

long TakePlace(Replacement& replacement)
{
    const std::string file = ToUtf8(replacement.file);
    const std::string target = ToUtf8(replacement.target);
    if (const long error = Flush(file.c_str(), O_WRONLY))
        return error;
    if (std::rename(file.c_str(), target.c_str()) != 0)
        return errno;
    replacement.file.Empty();
    // If the new name does not reach the disk, the old file is still there, whole.
    const std::string folder = FolderOf(target);
    Flush(folder.empty() ? "." : folder.c_str(), O_RDONLY | O_DIRECTORY);
    return 0;
}

void Abandon(Replacement& replacement) noexcept
{
    if (!replacement.file.IsEmpty()) {
        try {
            unlink(ToUtf8(replacement.file).c_str());
        } catch (...) { // No memory for the path: the file stays.
        }
        replacement.file.Empty();
    }
    if (replacement.held != kNoFile)
        CloseFile(replacement.held, true);
    replacement.held = kNoFile;
}

} // namespace dcm::system
