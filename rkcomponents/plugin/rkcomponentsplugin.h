#pragma once

#include <QtGlobal>

// The SDK version of the host core library this module is built against, packed 3.0.1.61.
constexpr quint32 RK_SDK_VERSION = 0x0300013D;
