// Raw memory, with a count.
#ifndef TINY_MALLOC_H
#define TINY_MALLOC_H

#include <cstddef>

void* mav_malloc(std::size_t size);
void mav_free(void* memory);

// Blocks that are allocated and not yet freed.
int tiny_live_blocks();

#endif
