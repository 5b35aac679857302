#include "memory/rkmemory.h"

#include <cstdlib>

void* rkMalloc(std::size_t size)
{
    return size ? std::malloc(size) : nullptr;
}

void rkFree(void* pointer)
{
    std::free(pointer);
}
