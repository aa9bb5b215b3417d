// Raw memory that is counted.
#ifndef TINY_MALLOC_H
#define TINY_MALLOC_H

#include <cstddef>

void* mav_malloc(std::size_t size);
void mav_free(void* memory);

// Blocks that were given out and not yet given back.
int tiny_live_blocks();

#endif
