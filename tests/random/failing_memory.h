// Memory whose n-th allocation fails: replaces the global operator new and the host's raw memory
// for the whole executable. Both are counted, so leaks show. Freed memory is overwritten, so that
// it does not look intact if it is still used by mistake.
// Threads: any; counts are for all threads together, and each thread makes only its own allocations
// fail.
#ifndef FAILING_MEMORY_H
#define FAILING_MEMORY_H

#include <cstddef>

namespace memory {

// The allocations so far, and those that have not been freed.
size_t NumAllocations();
size_t NumLive();
// Allocations of the host's raw memory, mav_malloc, so far.
size_t NumRawAllocations();

// While it lives, allocation number 'numBefore' of this thread, counted from 0, fails; later ones
// do not.
class FailingAllocation {
  public:
    explicit FailingAllocation(size_t numBefore);
    ~FailingAllocation();
    FailingAllocation(const FailingAllocation&) = delete;
    FailingAllocation& operator=(const FailingAllocation&) = delete;
};

// While it lives, 'use' runs before each allocation and release of this thread, except its own, as
// in a program that provides memory itself.
class UsingMemory {
  public:
    explicit UsingMemory(void (*use)());
    ~UsingMemory();
    UsingMemory(const UsingMemory&) = delete;
    UsingMemory& operator=(const UsingMemory&) = delete;
};

} // namespace memory

#endif
