#include "rkfullscreenactionfactory.h"

#include "rkfullscreenaction.h"

RkFullScreenActionFactory::RkFullScreenActionFactory(const QMetaObject* metaObject,
                                                     const RkGUID& guid)
    : RkClassFactory(metaObject, guid)
{
}

QObject* RkFullScreenActionFactory::createInstance(QScriptContext*)
{
    return createInstance();
}

QObject* RkFullScreenActionFactory::createInstance()
{
    return new RkFullScreenAction();
}

QObject* RkFullScreenActionFactory::createInstanceFor(void*)
{
    return nullptr;
}
