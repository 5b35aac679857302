#pragma once

#include "rktcustomclassfactory.h"

// The factory of a class T with a parameterless constructor.
template <typename T> class RkTClassFactory : public RkTCustomClassFactory<T>
{
public:
    RkTClassFactory(const QMetaObject* metaObject, const RkGUID& guid,
                    QScriptEngine::ValueOwnership ownership = QScriptEngine::QtOwnership)
        : RkTCustomClassFactory<T>(metaObject, guid, ownership)
    {
    }

    QObject* createInstance() override { return new T(); }
    QObject* createInstanceFor(void*) override { return createInstance(); }
    using RkClassFactory::createInstance;
};
