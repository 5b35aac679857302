#pragma once

#include "plugin/rkclassfactory.h"

#include <QByteArray>
#include <QMetaType>
#include <QScriptEngine>
#include <QScriptValue>

// A factory that makes its class T known to the host's script engine: scripts can construct T by
// its class name ("new RkToolPane()") and pass T pointers ("RkToolPane*") in and out of calls.
template <typename T> class RkTCustomClassFactory : public RkClassFactory
{
public:
    RkTCustomClassFactory(const QMetaObject* metaObject, const RkGUID& guid,
                          QScriptEngine::ValueOwnership ownership)
        : RkClassFactory(metaObject, guid)
    {
        s_ownership = ownership;
        s_factory = this;
    }

    ~RkTCustomClassFactory() override
    {
        if (s_factory == this)
            s_factory = nullptr;
    }

    void registerClass(QScriptEngine* engine) override
    {
        RkClassFactory::registerClass(engine);
        pointerTypeId();
        qScriptRegisterMetaType<T*>(engine, toScriptValue, fromScriptValue, QScriptValue());
        QScriptValue constructor = engine->newFunction(scriptConstructor, 0);
        QScriptValue metaObject = engine->newQMetaObject(&T::staticMetaObject, constructor);
        engine->globalObject().setProperty(className(), metaObject);
    }

    // The factory of type T currently alive, read by the script constructor.
    static RkTCustomClassFactory<T>* factory() { return s_factory; }

    // Registered once per process under the class name followed by '*'.
    static int pointerTypeId()
    {
        static const int id =
            qRegisterMetaType<T*>(QByteArray(T::staticMetaObject.className()).append('*'));
        return id;
    }

private:
    static QScriptValue toScriptValue(QScriptEngine* engine, T* const& object)
    {
        QScriptValue value = engine->newQObject(object, QScriptEngine::QtOwnership);
        registerEnumsOnClass(engine, &T::staticMetaObject, value);
        return value;
    }

    static void fromScriptValue(const QScriptValue& value, T*& object)
    {
        QObject* cast = T::staticMetaObject.cast(value.toQObject());
        object = static_cast<T*>(cast);
    }

    static QScriptValue scriptConstructor(QScriptContext* context, QScriptEngine* engine)
    {
        if (!s_factory)
            return QScriptValue();
        QObject* object = s_factory->createInstance(context);
        QScriptValue value = engine->newQObject(object, RkClassFactory::s_ownership);
        registerEnumsOnClass(engine, &T::staticMetaObject, value);
        return value;
    }

    static inline RkTCustomClassFactory<T>* s_factory = nullptr;
};
