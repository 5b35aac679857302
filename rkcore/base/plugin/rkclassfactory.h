#pragma once

#include "plugin/rkguid.h"
#include "rkcoreglobal.h"

#include <QScriptEngine>
#include <QString>

struct QMetaObject;
class QObject;
class QScriptContext;
class QScriptValue;

// Creates the objects of one class for the host: panes, actions, views and stored data are all made
// through their factory, found by class name or by GUID. Factories are owned by the module that
// defines them (usually static objects); the host only keeps pointers.
class RKCORE_EXPORT RkClassFactory
{
public:
    RkClassFactory(const QMetaObject* metaObject, const RkGUID& guid);
    virtual ~RkClassFactory();

    RkClassFactory(const RkClassFactory&) = delete;
    RkClassFactory& operator=(const RkClassFactory&) = delete;

    // Called when a script constructs the class; the default ignores the arguments and answers
    // createInstance().
    virtual QObject* createInstance(QScriptContext* context);
    // A new object of the class, owned by the caller.
    virtual QObject* createInstance() = 0;
    // A new object made for the given host object (for example the element data of a node). The
    // default ignores the argument and makes nothing.
    virtual QObject* createInstanceFor(void* data);
    // Makes the class known to the script engine. The default does nothing: the class then has no
    // script constructor.
    virtual void registerClass(QScriptEngine* engine);

    const QMetaObject* metaObject() const { return m_metaObject; }
    QString className() const;
    const RkGUID& getGUID() const { return m_guid; }
    // True when the class is, or derives from, the class of the given meta-object.
    bool inherits(const QMetaObject* base) const;

    // Ownership that script-constructed objects get; modules set it when their factories are made.
    static QScriptEngine::ValueOwnership s_ownership;

    // Puts every enumerator key of the meta-object on the script value as a number, so scripts can
    // write obj.SomeEnumValue.
    static void registerEnumsOnClass(QScriptEngine* engine, const QMetaObject* metaObject,
                                     QScriptValue& value);

private:
    const QMetaObject* m_metaObject;
    RkGUID m_guid;
};
