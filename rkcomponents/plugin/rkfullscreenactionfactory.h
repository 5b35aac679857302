#pragma once

#include "plugin/rkclassfactory.h"

// Makes RkFullScreenAction. The action is not made known to the script engine.
class RkFullScreenActionFactory : public RkClassFactory
{
public:
    RkFullScreenActionFactory(const QMetaObject* metaObject, const RkGUID& guid);

    QObject* createInstance(QScriptContext* context) override;
    QObject* createInstance() override;
    QObject* createInstanceFor(void* data) override;
};
