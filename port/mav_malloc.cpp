// Raw memory of the default host: the C library's.
#include <port/mav_malloc.h>

#include <cstdlib>

void* mav_malloc(std::size_t size)
{
    // malloc(0) may return null, which would read as "no memory".
    return std::malloc(size ? size : 1);
}

void mav_free(void* memory)
{
    std::free(memory);
}
