#pragma once

#include "dcm/platform/automation.h"
#include "dcm/platform/cfile.h"
#include "dcm/platform/cstring.h"

#include <cstddef>
#include <cstdint>

/// The file calls of the system. They throw only `std::bad_alloc`. Each reports an error by the
/// system's number, 0 for none.
namespace dcm::system {

using FileHandle = std::intptr_t;
inline constexpr FileHandle kNoFile = -1;

/// A file of this many bytes or more is not read, and no write makes a file that large.
inline constexpr std::uint64_t kSizeLimit = std::uint64_t{1} << 31;

/// Opens a file for exclusive use, by the flags of `CFile`. Returns `kNoFile` on a failure, which
/// leaves an existing file as it was. `refusal` is then the cause of a failure that the error
/// number does not give, otherwise it is not changed.
FileHandle OpenFile(const CString& path, UINT flags, long& error, CFileException::Cause& refusal);

/// The number of this process. A forked child shares the open files of its parent.
long ProcessNumber() noexcept;

/// The length of an open file in bytes; 0 for a device.
long FileLength(FileHandle file, std::uint64_t& length) noexcept;

/// Reads up to `count` bytes; `done` is how many the system gave, 0 only at the end of the file.
long ReadSome(FileHandle file, void* buffer, std::size_t count, std::size_t& done) noexcept;

/// Writes up to `count` bytes; `done` is how many the system took.
long WriteSome(FileHandle file, const void* buffer, std::size_t count, std::size_t& done) noexcept;

/// Memory for `size` bytes of a text, to be released by `ReleaseMemory`. Much memory has pages of
/// its own, which no other part of the program uses: large ones where the system has them, each of
/// which costs one page fault. Throws `std::bad_alloc`.
char* TakeMemory(std::size_t size);

/// Releases memory that was taken for `size` bytes.
void ReleaseMemory(char* memory, std::size_t size) noexcept;

/// Closes a file. With `endUse` the exclusive use ends, even while child processes have the file
/// open too; without, it lasts until every process has closed the file.
long CloseFile(FileHandle file, bool endUse) noexcept;

/// The cause that an error number means; `generic` for most.
CFileException::Cause CauseOf(long error) noexcept;

} // namespace dcm::system
