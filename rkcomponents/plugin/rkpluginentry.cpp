#include "rkcomponentsplugin.h"

// The module's two entry points, under their plain names.
extern "C" Q_DECL_EXPORT quint32 getSDKVersion()
{
    return RK_SDK_VERSION;
}

extern "C" Q_DECL_EXPORT void* getPluginDefinition()
{
    return nullptr;
}
