// Memory whose n-th allocation fails: the global operator new and the host's raw memory, replaced
// for the whole executable. Both count, so leaks show; freed memory is overwritten, so that what
// is still used by mistake does not look whole.
// Threads: any; counts are of all threads together, and each makes its own allocations fail.
#ifndef FAILING_MEMORY_H
#define FAILING_MEMORY_H

#include <cstddef>

namespace memory {

// Allocations so far, and those that have not been freed.
size_t NumAllocations();
size_t NumLive();
// Allocations of the host's raw memory, mav_malloc, so far.
size_t NumRawAllocations();

// While it lives, allocation number 'numBefore' of this thread, counted from 0, fails; those after
// it do not.
class FailingAllocation {
  public:
    explicit FailingAllocation(size_t numBefore);
    ~FailingAllocation();
    FailingAllocation(const FailingAllocation&) = delete;
    FailingAllocation& operator=(const FailingAllocation&) = delete;
};

// While it lives, 'use' runs before each allocation and each release of this thread, but for its
// own: what a program may do that serves memory itself.
class UsingMemory {
  public:
    explicit UsingMemory(void (*use)());
    ~UsingMemory();
    UsingMemory(const UsingMemory&) = delete;
    UsingMemory& operator=(const UsingMemory&) = delete;
};

} // namespace memory

#endif
