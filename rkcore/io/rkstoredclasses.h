#pragma once

#include "rkcoreglobal.h"

#include <QString>

#include <functional>

class RkBase;
struct QMetaObject;

// Class look-up for the scene file: stored objects are written with their class GUID and made
// again through the class factory of that GUID. Core classes register here; classes of modules
// are found through the application's class factories.
RKCORE_EXPORT void rkRegisterStoredClass(const QString& guid, const QMetaObject* metaObject,
                                         std::function<RkBase*()> create);
// The GUID under which the object's class is stored, or an empty string.
RKCORE_EXPORT QString rkStoredClassGuid(const QString& className);
// A new object of the class with that GUID, or null with *error set.
RKCORE_EXPORT RkBase* rkCreateStoredObject(const QString& guid, QString* error);
