#include "tests/allocations.h"

#include <cstdlib>
#include <new>
#include <vector>

namespace test {

constinit std::atomic<long> live = 0;
constinit thread_local long untilFailure = 0;
constinit thread_local std::size_t wanted = 0;

bool LibraryLeaks()
{
    // Without a place that is told, the compiler may leave the memory out.
    [[maybe_unused]] static const void* volatile place = nullptr;
    struct Element
    {
        Element() = default;
        Element(const Element&)
        {
            place = this;
            throw std::bad_alloc();
        }
    };
    const std::vector<Element> elements(1);
    const long before = live;
    try {
        const std::vector<Element> copy(elements);
    } catch (const std::bad_alloc&) {
    }
    return live != before;
}

} // namespace test

using namespace test;

// If they were inlined, the compiler would warn that memory from one function is released by
// another.
[[gnu::noinline]] void* operator new(std::size_t size, const std::nothrow_t&) noexcept
{
    wanted += size;
    void* const memory = --untilFailure == 0 ? nullptr : std::malloc(size == 0 ? 1 : size);
    live += memory != nullptr ? 1 : 0;
    return memory;
}

[[gnu::noinline]] void* operator new(std::size_t size)
{
    if (void* const memory = operator new(size, std::nothrow))
        return memory;
    throw std::bad_alloc();
}

[[gnu::noinline]] void operator delete(void* memory) noexcept
{
    live -= memory != nullptr ? 1 : 0;
    std::free(memory);
}

[[gnu::noinline]] void operator delete(void* memory, std::size_t) noexcept
{
    operator delete(memory);
}
