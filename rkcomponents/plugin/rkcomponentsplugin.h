#pragma once

#include <QtGlobal>

class RkPlugin;

// The SDK version of the host core library this module is built against, packed 3.0.1.61.
constexpr quint32 RK_SDK_VERSION = 0x0300013D;

// The module's plug-in object with all its factories; set up while the module loads.
RkPlugin* rkComponentsPlugin();
