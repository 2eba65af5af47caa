#pragma once

#include "benchmarks/contestant.h"

#include <cstddef>
#include <filesystem>
#include <memory>
#include <string_view>

/// Reading and writing with the standard library alone: the least time that the work needs, and the
/// time of a host that does it in the simplest way.
namespace dcm::bench {

/// The bytes of a whole file.
struct FileBytes
{
    std::unique_ptr<char[]> bytes;
    std::size_t size = 0;

    std::string_view View() const { return {bytes.get(), size}; }
};
FileBytes ReadFile(const std::filesystem::path& path);

/// The floor for reading: one pass over the bytes, the numbers of each block and nothing else.
BlockNumbers ReadFloor(const std::filesystem::path& path);

} // namespace dcm::bench
