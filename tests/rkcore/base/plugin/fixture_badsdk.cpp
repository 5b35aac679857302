#include "plugin/rkplugin.h"

// A module built against SDK 4: a host of SDK 3 must not take its definition.
static RkPlugin plugin(QStringLiteral("Future Module"), QString(), QString(), 0x01000000);

extern "C" Q_DECL_EXPORT quint32 getSDKVersion()
{
    return 0x04000000;
}

extern "C" Q_DECL_EXPORT RkPlugin* getPluginDefinition()
{
    return &plugin;
}
