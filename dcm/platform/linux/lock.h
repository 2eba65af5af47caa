#pragma once

#include <cerrno>
#include <sys/file.h>

namespace dcm::system {

/// Locks the whole file without waiting. Returns false when somebody else has locked it. Where the
/// file system has no such locks, the file is used without one.
inline bool Lock(int file)
{
    while (flock(file, LOCK_EX | LOCK_NB) != 0) {
        if (errno != EINTR)
            return errno != EWOULDBLOCK;
    }
    return true;
}

} // namespace dcm::system
