#pragma once

namespace test {

/// How many pieces of memory from `operator new` are in use in the test executable.
long LiveAllocations() noexcept;

/// Makes the allocation that the calling thread makes as its `number`th from now on fail, and no
/// other; 0 for none.
void FailAllocation(long number) noexcept;

/// Whether that allocation has been asked for, and has failed.
bool AllocationHasFailed() noexcept;

} // namespace test
