#include "rkassertcast.h"

QString RkAssertCast::failureMessage()
{
    return tr("Failure to cast RkAssertCast");
}
