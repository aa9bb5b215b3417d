#include "random/failing_memory.h"

#include <atomic>
#include <cstdlib>
#include <cstring>
#include <malloc.h>
#include <new>

#include <port/mav_malloc.h>

namespace {

// The counters must not order threads, because that would hide races.
constexpr std::memory_order kCountOnly = std::memory_order_relaxed;
std::atomic<size_t> s_numAllocations{0};
std::atomic<size_t> s_numRawAllocations{0};
std::atomic<size_t> s_numLive{0};
thread_local bool s_isArmed = false;
thread_local size_t s_numUntilFailure = 0;
thread_local void (*s_use)() = nullptr;

void Use()
{
    if (!s_use)
        return;
    void (*const use)() = s_use;
    s_use = nullptr;
    use();
    s_use = use;
}

void* AllocateOrNull(size_t size)
{
    Use();
    if (s_isArmed && s_numUntilFailure-- == 0) {
        s_isArmed = false;
        return nullptr;
    }
    void* memory = std::malloc(size ? size : 1);
    if (!memory)
        return nullptr;
    s_numLive.fetch_add(1, kCountOnly);
    s_numAllocations.fetch_add(1, kCountOnly);
    return memory;
}

void* Allocate(size_t size)
{
    void* memory = AllocateOrNull(size);
    if (!memory)
        throw std::bad_alloc();
    return memory;
}

void Free(void* memory) noexcept
{
    if (!memory)
        return;
    Use();
    s_numLive.fetch_sub(1, kCountOnly);
    // Large blocks go back to the system anyway.
    const size_t size = malloc_usable_size(memory);
    if (size <= 4096)
        std::memset(memory, 0xdd, size);
    std::free(memory);
}

} // namespace

size_t memory::NumAllocations()
{
    return s_numAllocations.load(kCountOnly);
}

size_t memory::NumRawAllocations()
{
    return s_numRawAllocations.load(kCountOnly);
}

size_t memory::NumLive()
{
    return s_numLive.load(kCountOnly);
}

memory::FailingAllocation::FailingAllocation(size_t numBefore)
{
    s_numUntilFailure = numBefore;
    s_isArmed = true;
}

memory::FailingAllocation::~FailingAllocation()
{
    s_isArmed = false;
}

memory::UsingMemory::UsingMemory(void (*use)())
{
    s_use = use;
}

memory::UsingMemory::~UsingMemory()
{
    s_use = nullptr;
}

void* operator new(size_t size)
{
    return Allocate(size);
}
void* operator new[](size_t size)
{
    return Allocate(size);
}
void operator delete(void* memory) noexcept
{
    Free(memory);
}
void operator delete[](void* memory) noexcept
{
    Free(memory);
}
void operator delete(void* memory, size_t) noexcept
{
    Free(memory);
}
void operator delete[](void* memory, size_t) noexcept
{
    Free(memory);
}

// The executable's definition takes precedence over the host library's.
void* mav_malloc(size_t size)
{
    s_numRawAllocations.fetch_add(1, kCountOnly);
    return AllocateOrNull(size);
}

void mav_free(void* memory)
{
    Free(memory);
}
