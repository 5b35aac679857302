#pragma once

#if defined(__SANITIZE_ADDRESS__)
#include <dlfcn.h>
#endif

// In sanitizer builds, keeps the software OpenGL driver loaded until the program ends. The leak
// checker runs after the driver would otherwise have been unloaded; kept loaded, the driver's own
// leftovers are reported under its name, which the suppressions list, instead of under a nameless
// module. Call before the first OpenGL context is made. Does nothing in other builds.
inline void rkKeepGLDriverLoaded()
{
#if defined(__SANITIZE_ADDRESS__)
    for (const char* path : {"/usr/lib/x86_64-linux-gnu/dri/swrast_dri.so", "swrast_dri.so"}) {
        if (dlopen(path, RTLD_NOW | RTLD_NODELETE))
            return;
    }
#endif
}
