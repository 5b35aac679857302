#include "rkcomponentsplugin.h"

class RkPlugin;

// The module's two entry points, under their plain names; everything else stays hidden.
extern "C" Q_DECL_EXPORT quint32 getSDKVersion()
{
    return RK_SDK_VERSION;
}

extern "C" Q_DECL_EXPORT RkPlugin* getPluginDefinition()
{
    return rkComponentsPlugin();
}
