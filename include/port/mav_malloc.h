// The host tool chain's raw memory, used by the class allocators for sizes other than their own.
#ifndef MAV_MALLOC_H
#define MAV_MALLOC_H

#include <cstddef>

// Threads: any may ask and give back at any time, what another one got as well.

// 'size' bytes aligned for every type, or null when there are none to be had.
void* mav_malloc(std::size_t size);

// Gives back what mav_malloc returned; null is allowed.
void mav_free(void* memory);

#endif
