#include "support/rkgldriver.h"

#if defined(__SANITIZE_ADDRESS__)
#include <QOffscreenSurface>
#include <QOpenGLContext>

#include <dlfcn.h>
#include <link.h>

#include <cstring>
#include <string>
#include <vector>

namespace
{

// Mesa's drivers are loaded under names like "swrast_dri.so".
bool isGLDriver(const char* path)
{
    static const char suffix[] = "_dri.so";
    const size_t length = std::strlen(path);
    const size_t suffixLength = sizeof(suffix) - 1;
    return length > suffixLength && std::strcmp(path + length - suffixLength, suffix) == 0;
}

int collectGLDriver(dl_phdr_info* info, size_t, void* drivers)
{
    if (info->dlpi_name && isGLDriver(info->dlpi_name))
        static_cast<std::vector<std::string>*>(drivers)->emplace_back(info->dlpi_name);
    return 0;
}

} // namespace
#endif

void rkKeepGLDriverLoaded()
{
#if defined(__SANITIZE_ADDRESS__)
    // The first context loads the driver, and the display connection keeps it until it closes.
    {
        QOffscreenSurface surface;
        surface.create();
        QOpenGLContext context;
        if (!context.create() || !context.makeCurrent(&surface))
            return;
        context.doneCurrent();
    }
    // Opened only after the walk: the loader's list is not changed while it is being read.
    std::vector<std::string> drivers;
    dl_iterate_phdr(collectGLDriver, &drivers);
    for (const std::string& driver : drivers)
        dlopen(driver.c_str(), RTLD_NOW | RTLD_NOLOAD | RTLD_NODELETE);
#endif
}
