#pragma once

#include "plugin/rkclassfactory.h"
#include "plugin/rkguid.h"

// A class factory for test classes: makes T with its parameterless constructor.
template <typename T> class RkTestFactory : public RkClassFactory
{
public:
    explicit RkTestFactory(const char* guid)
        : RkClassFactory(&T::staticMetaObject, RkGUID::fromString(QLatin1String(guid)))
    {
    }
    QObject* createInstance() override { return new T; }
};
