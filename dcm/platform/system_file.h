#pragma once

#include "dcm/platform/automation.h"
#include "dcm/platform/cfile.h"
#include "dcm/platform/cstring.h"

#include <cstddef>
#include <cstdint>

/// The file calls of the system. None of them throws but for want of memory; each reports an error
/// by the system's number, 0 for none.
namespace dcm::system {

using FileHandle = std::intptr_t;
inline constexpr FileHandle kNoFile = -1;

/// Opens a file for exclusive use, by the flags of `CFile`. `refusal` tells what a failure without
/// an error number means. Returns `kNoFile` on a failure, which leaves an existing file as it was.
FileHandle OpenFile(const CString& path, UINT flags, long& error, CFileException::Cause& refusal);

long FileLength(FileHandle file, std::uint64_t& length) noexcept;

/// Reads what the system hands out at once, at least a byte unless the file ends here.
long ReadSome(FileHandle file, void* buffer, std::size_t count, std::size_t& done) noexcept;

/// Writes what the system takes at once.
long WriteSome(FileHandle file, const void* buffer, std::size_t count, std::size_t& done) noexcept;

/// Says that memory is about to be filled as a whole. Where the system can, it comes in large pages
/// then, each of which costs one fault; where it cannot, nothing changes.
void ExpectToFill(void* memory, std::size_t size) noexcept;

long CloseFile(FileHandle file) noexcept;

CFileException::Cause CauseOf(long error) noexcept;

} // namespace dcm::system
