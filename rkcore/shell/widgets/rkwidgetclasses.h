#pragma once

#include "rkcoreglobal.h"

#include <QList>

class RkClassFactory;

// The factories of the property widgets (float, integer, on/off), found by the class name that
// RkProperty::widgetClassName() gives. The application registers them with its class registry.
RKCORE_EXPORT QList<RkClassFactory*> rkWidgetClassFactories();
