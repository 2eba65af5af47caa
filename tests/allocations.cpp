#include "tests/allocations.h"

#include <atomic>
#include <cstddef>
#include <cstdlib>
#include <new>

namespace {

constinit std::atomic<long> live = 0;
constinit thread_local long untilFailure = 0;
constinit thread_local bool failed = false;

} // namespace

long test::LiveAllocations() noexcept
{
    return live;
}

void test::FailAllocation(long number) noexcept
{
    untilFailure = number;
    failed = false;
}

bool test::AllocationHasFailed() noexcept
{
    return failed;
}

void* operator new(std::size_t size, const std::nothrow_t&) noexcept
{
    if (untilFailure > 0 && --untilFailure == 0) {
        failed = true;
        return nullptr;
    }
    void* const memory = std::malloc(size == 0 ? 1 : size);
    live += memory != nullptr ? 1 : 0;
    return memory;
}

void* operator new(std::size_t size)
{
    if (void* const memory = operator new(size, std::nothrow))
        return memory;
    throw std::bad_alloc();
}

void operator delete(void* memory) noexcept
{
    live -= memory != nullptr ? 1 : 0;
    std::free(memory);
}

void operator delete(void* memory, std::size_t) noexcept
{
    operator delete(memory);
}
