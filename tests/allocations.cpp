#include "tests/allocations.h"

#include <atomic>
#include <cstddef>
#include <cstdlib>
#include <new>

namespace {

constinit std::atomic<long> live = 0;

void* Allocate(std::size_t size) noexcept
{
    void* const memory = std::malloc(size == 0 ? 1 : size);
    if (memory != nullptr)
        ++live;
    return memory;
}

void Release(void* memory) noexcept
{
    if (memory != nullptr)
        --live;
    std::free(memory);
}

} // namespace

namespace test {

long LiveAllocations() noexcept
{
    return live;
}

} // namespace test

void* operator new(std::size_t size)
{
    if (void* const memory = Allocate(size))
        return memory;
    throw std::bad_alloc();
}

void* operator new(std::size_t size, const std::nothrow_t&) noexcept
{
    return Allocate(size);
}

void operator delete(void* memory) noexcept
{
    Release(memory);
}

void operator delete(void* memory, std::size_t) noexcept
{
    Release(memory);
}
