#include "rkstoredclasses.h"

#include "rkapp.h"
#include "rkbone.h"
#include "rkcamera.h"
#include "rkclassfactory.h"
#include "rklight.h"
#include "rkskeleton.h"

#include <QHash>

namespace
{

struct StoredClass {
    QString guid;
    const QMetaObject* metaObject = nullptr;
    std::function<RkBase*()> create;
};

struct Registry {
    QHash<QString, StoredClass> byGuid; // GUIDs compare without regard to case
    QHash<QString, QString> guidByClass;

    void add(const QString& guid, const QMetaObject* meta, std::function<RkBase*()> create)
    {
        byGuid.insert(guid.toLower(), StoredClass{guid, meta, std::move(create)});
        guidByClass.insert(QString::fromLatin1(meta->className()), guid);
    }
};

Registry& registry()
{
    static Registry r = [] {
        Registry core;
        core.add(QStringLiteral("7d2b8f10-3c41-4e8a-9a51-0f6c2d7e1a01"), &RkNode::staticMetaObject,
                 [] { return new RkNode; });
        core.add(QStringLiteral("7d2b8f10-3c41-4e8a-9a51-0f6c2d7e1a02"),
                 &RkSkeleton::staticMetaObject, [] { return new RkSkeleton; });
        core.add(QStringLiteral("7d2b8f10-3c41-4e8a-9a51-0f6c2d7e1a03"), &RkBone::staticMetaObject,
                 [] { return new RkBone; });
        core.add(QStringLiteral("7d2b8f10-3c41-4e8a-9a51-0f6c2d7e1a04"),
                 &RkCamera::staticMetaObject, [] { return new RkCamera; });
        core.add(QStringLiteral("7d2b8f10-3c41-4e8a-9a51-0f6c2d7e1a05"), &RkLight::staticMetaObject,
                 [] { return new RkLight; });
        return core;
    }();
    return r;
}

} // namespace

void rkRegisterStoredClass(const QString& guid, const QMetaObject* metaObject,
                           std::function<RkBase*()> create)
{
    if (guid.isEmpty() || !metaObject || !create)
        return;
    registry().add(guid, metaObject, std::move(create));
}

QString rkStoredClassGuid(const QString& className)
{
    const QString guid = registry().guidByClass.value(className);
    if (!guid.isEmpty())
        return guid;
    if (RkClassFactory* factory = RkApp::findClassFactory(className))
        return factory->getGUID().toString();
    return QString();
}

RkBase* rkCreateStoredObject(const QString& guid, QString* error)
{
    const auto it = registry().byGuid.constFind(guid.toLower());
    if (it == registry().byGuid.constEnd()) {
        // Classes of modules come from their class factories.
        const RkGUID id = RkGUID::fromString(guid);
        RkClassFactory* factory = id.isNull() ? nullptr : RkApp::findClassFactory(id);
        if (!factory) {
            if (error)
                *error = QStringLiteral("no class is known by the GUID %1").arg(guid);
            return nullptr;
        }
        QObject* made = factory->createInstance();
        auto* object = qobject_cast<RkBase*>(made);
        if (!object) {
            delete made;
            if (error)
                *error = QStringLiteral("%1 (GUID %2) is not a class that a scene can store")
                             .arg(factory->className(), guid);
        }
        return object;
    }
    RkBase* object = it->create();
    if (!object && error)
        *error = QStringLiteral("the class factory of %1 made nothing")
                     .arg(QString::fromLatin1(it->metaObject->className()));
    return object;
}
