#pragma once

#include "rkcoreglobal.h"

#include <QList>

class RkClassFactory;

// The factories of the scene classes that a scene file stores (node, skeleton, bone, camera,
// light). The application registers them with its class registry, beside the classes of modules;
// the GUIDs are the classes' identity in stored scenes and never change.
RKCORE_EXPORT QList<RkClassFactory*> rkSceneClassFactories();
