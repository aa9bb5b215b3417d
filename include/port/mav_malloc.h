// The host tool chain's raw memory, used by the class allocators for sizes other than their own.
#ifndef MAV_MALLOC_H
#define MAV_MALLOC_H

#include <cstddef>

// Threads: any may call at any time, and may free what another one allocated.

// 'size' bytes aligned for every type, or null when no memory is left.
void* mav_malloc(std::size_t size);

// Gives back what mav_malloc returned; null is allowed.
void mav_free(void* memory);

#endif
