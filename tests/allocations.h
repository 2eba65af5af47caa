#pragma once

namespace test {

/// How many pieces of memory from `operator new` are in use in the test executable.
long LiveAllocations() noexcept;

} // namespace test
