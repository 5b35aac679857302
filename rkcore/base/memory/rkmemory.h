#pragma once

#include "rkcoreglobal.h"

#include <cstddef>

// The host allocator. Memory that the host hands to a module, or that a module hands to the host,
// comes from rkMalloc and goes back through rkFree. rkMalloc(0) gives null; rkFree(null) is
// allowed.
RKCORE_EXPORT void* rkMalloc(std::size_t size);
RKCORE_EXPORT void rkFree(void* pointer);
