#pragma once

#include <atomic>
#include <cstddef>

/// @file
/// All allocations of a test executable that has allocations.cpp: counted, and failing when a test
/// wants it.

namespace test {

/// The number of allocations that have not been released.
extern std::atomic<long> live;
/// The thread's allocation that fails, counted from now; 0 or less for none.
extern constinit thread_local long untilFailure;
/// The number of bytes that the thread has requested.
extern constinit thread_local std::size_t wanted;

/// Whether the standard library itself loses the memory of a list of which an element cannot be
/// copied, as libc++ does before version 15. What is still allocated then says nothing.
bool LibraryLeaks();

} // namespace test
