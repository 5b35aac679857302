#pragma once

#include "rkcoreglobal.h"

#include <QList>
#include <QObject>

#include <memory>

struct QMetaObject;
class QScriptEngine;
class RkClassFactory;
class RkGUID;
class RkPlugin;

// The one class registry: loads modules, keeps their plug-in objects and answers factory look-ups
// by class name or GUID, for the classes of modules and for the core's own stored classes alike.
// Owned by RkApp. Loaded libraries stay loaded until the process ends: objects made by a module
// (panes, actions, stored data) may live as long as the application.
class RKCORE_EXPORT RkPluginMgr : public QObject
{
    Q_OBJECT
public:
    // The SDK version of this host core, packed 3.0.1.61. A module built against another major
    // version is refused.
    static constexpr quint32 SDKVersion = 0x0300013D;

    explicit RkPluginMgr(QScriptEngine* engine, QObject* parent = nullptr);
    ~RkPluginMgr() override;

    // The registry of the running application (the newest one alive), or null.
    static RkPluginMgr* instance();

    // Loads one module file: resolves getSDKVersion and getPluginDefinition, checks the SDK major
    // version and registers the plug-in. On any failure one line goes to the log, the library is
    // unloaded and false is returned.
    bool loadModule(const QString& filePath);
    // Loads every shared library in the folder, in file-name order; returns how many loaded.
    int loadModules(const QString& dirPath);

    // Registers a plug-in object: its factories become known and every factory registers its
    // class with the script engine. A factory whose class name or GUID is already taken is
    // skipped with a log line. Adding the same plug-in twice does nothing and returns false.
    bool addPlugin(RkPlugin* plugin, const QString& filePath = QString());
    // Registers one factory that belongs to no module (the core's own classes). Answers false,
    // and registers nothing, for null or when the class name or GUID is already taken.
    bool addClassFactory(RkClassFactory* factory);

    QList<RkPlugin*> getPlugins() const;
    QString getPluginFilePath(const RkPlugin* plugin) const;
    // Every registered factory, plug-ins in load order, factories in their plug-in's order.
    QList<RkClassFactory*> getClassFactories() const;
    // The registered factories whose class derives from the given one.
    QList<RkClassFactory*> getClassFactories(const QMetaObject* base) const;
    RkClassFactory* findClassFactory(const QString& className) const;
    RkClassFactory* findClassFactory(const RkGUID& guid) const;

Q_SIGNALS:
    void pluginAdded(RkPlugin* plugin);

private:
    struct Private;
    std::unique_ptr<Private> d;
};
