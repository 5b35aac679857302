#include "plugin/rkclassfactory.h"

#include <QMetaEnum>
#include <QMetaObject>
#include <QScriptValue>

QScriptEngine::ValueOwnership RkClassFactory::s_ownership = QScriptEngine::QtOwnership;

RkClassFactory::RkClassFactory(const QMetaObject* metaObject, const RkGUID& guid)
    : m_metaObject(metaObject), m_guid(guid)
{
}

RkClassFactory::~RkClassFactory() = default;

QObject* RkClassFactory::createInstance(QScriptContext*)
{
    return createInstance();
}

QObject* RkClassFactory::createInstanceFor(void*)
{
    return nullptr;
}

void RkClassFactory::registerClass(QScriptEngine*) {}

QString RkClassFactory::className() const
{
    return m_metaObject ? QString::fromLatin1(m_metaObject->className()) : QString();
}

bool RkClassFactory::inherits(const QMetaObject* base) const
{
    for (const QMetaObject* mo = m_metaObject; mo; mo = mo->superClass()) {
        if (mo == base)
            return true;
    }
    return false;
}

void RkClassFactory::registerEnumsOnClass(QScriptEngine*, const QMetaObject* metaObject,
                                          QScriptValue& value)
{
    if (!metaObject || !value.isObject())
        return;
    for (int i = 0; i < metaObject->enumeratorCount(); ++i) {
        const QMetaEnum e = metaObject->enumerator(i);
        for (int k = 0; k < e.keyCount(); ++k)
            value.setProperty(QString::fromLatin1(e.key(k)), e.value(k));
    }
}
