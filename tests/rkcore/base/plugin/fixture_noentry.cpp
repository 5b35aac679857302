#include <QtGlobal>

// A library that looks like a module but has no plug-in definition.
extern "C" Q_DECL_EXPORT quint32 getSDKVersion()
{
    return 0x0300013D;
}
