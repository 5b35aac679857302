#include "plugin/rkpluginmgr.h"

#include "log/rklog.h"
#include "plugin/rkclassfactory.h"
#include "plugin/rkguid.h"
#include "plugin/rkplugin.h"

#include <QDir>
#include <QFileInfo>
#include <QHash>
#include <QLibrary>
#include <QPointer>
#include <QScriptEngine>

namespace
{
using SDKVersionFn = quint32 (*)();
using PluginDefinitionFn = RkPlugin* (*)();

RkPluginMgr* theInstance = nullptr;
} // namespace

struct RkPluginMgr::Private {
    struct Entry {
        RkPlugin* plugin = nullptr;
        QString filePath;
    };
    QPointer<QScriptEngine> engine;
    QList<Entry> plugins;
    QList<RkClassFactory*> factories;
    QHash<QString, RkClassFactory*> byName;
    QHash<RkGUID, RkClassFactory*> byGuid;
};

RkPluginMgr::RkPluginMgr(QScriptEngine* engine, QObject* parent)
    : QObject(parent), d(std::make_unique<Private>())
{
    d->engine = engine;
    theInstance = this;
}

RkPluginMgr::~RkPluginMgr()
{
    if (theInstance == this)
        theInstance = nullptr;
}

RkPluginMgr* RkPluginMgr::instance()
{
    return theInstance;
}

bool RkPluginMgr::loadModule(const QString& filePath)
{
    const QString name = QFileInfo(filePath).fileName();
    // Loaded libraries are never unloaded after success (see the class comment), so the QLibrary
    // object itself may go; only a refused module is unloaded again.
    QLibrary library(filePath);
    if (!library.load()) {
        rkLog(tr("Plug-in %1 not loaded: %2").arg(name, library.errorString()));
        return false;
    }
    auto sdkVersion = reinterpret_cast<SDKVersionFn>(library.resolve("getSDKVersion"));
    auto definition = reinterpret_cast<PluginDefinitionFn>(library.resolve("getPluginDefinition"));
    QString refusal;
    RkPlugin* plugin = nullptr;
    if (!sdkVersion || !definition) {
        refusal =
            tr("Plug-in %1 refused: it lacks the entry point %2")
                .arg(name, QLatin1String(!sdkVersion ? "getSDKVersion" : "getPluginDefinition"));
    } else if ((sdkVersion() >> 24) != (SDKVersion >> 24)) {
        refusal = tr("Plug-in %1 refused: built for SDK %2, this host has SDK %3")
                      .arg(name, RkPlugin::versionToString(sdkVersion()),
                           RkPlugin::versionToString(SDKVersion));
    } else if (!(plugin = definition())) {
        refusal = tr("Plug-in %1 refused: it gives no plug-in definition").arg(name);
    } else {
        for (const Private::Entry& e : d->plugins) {
            if (e.plugin == plugin)
                refusal = tr("Plug-in %1 refused: already loaded from %2").arg(name, e.filePath);
        }
    }
    if (!refusal.isEmpty()) {
        rkLog(refusal);
        // A module already in use (loaded twice) must stay mapped.
        if (!plugin)
            library.unload();
        return false;
    }
    return addPlugin(plugin, QFileInfo(filePath).absoluteFilePath());
}

int RkPluginMgr::loadModules(const QString& dirPath)
{
    QDir dir(dirPath);
    if (!dir.exists()) {
        rkLog(tr("Plug-in folder %1 does not exist").arg(dirPath));
        return 0;
    }
    int loaded = 0;
    const QFileInfoList files = dir.entryInfoList(QDir::Files, QDir::Name);
    for (const QFileInfo& info : files) {
        if (QLibrary::isLibrary(info.fileName()) && loadModule(info.absoluteFilePath()))
            ++loaded;
    }
    return loaded;
}

bool RkPluginMgr::addPlugin(RkPlugin* plugin, const QString& filePath)
{
    if (!plugin)
        return false;
    for (const Private::Entry& e : d->plugins) {
        if (e.plugin == plugin)
            return false;
    }
    d->plugins.append({plugin, filePath});
    for (RkClassFactory* factory : plugin->getClassFactories()) {
        if (!addClassFactory(factory))
            rkLog(tr("Class %1 of plug-in %2 skipped: its name or GUID is already registered")
                      .arg(factory->className(), plugin->getName()));
    }
    Q_EMIT pluginAdded(plugin);
    return true;
}

bool RkPluginMgr::addClassFactory(RkClassFactory* factory)
{
    if (!factory)
        return false;
    const QString className = factory->className();
    if (d->byName.contains(className) || d->byGuid.contains(factory->getGUID()))
        return false;
    d->factories.append(factory);
    d->byName.insert(className, factory);
    if (!factory->getGUID().isNull())
        d->byGuid.insert(factory->getGUID(), factory);
    if (d->engine)
        factory->registerClass(d->engine);
    return true;
}

QList<RkPlugin*> RkPluginMgr::getPlugins() const
{
    QList<RkPlugin*> plugins;
    for (const Private::Entry& e : d->plugins)
        plugins.append(e.plugin);
    return plugins;
}

QString RkPluginMgr::getPluginFilePath(const RkPlugin* plugin) const
{
    for (const Private::Entry& e : d->plugins) {
        if (e.plugin == plugin)
            return e.filePath;
    }
    return QString();
}

QList<RkClassFactory*> RkPluginMgr::getClassFactories() const
{
    return d->factories;
}

QList<RkClassFactory*> RkPluginMgr::getClassFactories(const QMetaObject* base) const
{
    QList<RkClassFactory*> result;
    for (RkClassFactory* factory : d->factories) {
        if (factory->inherits(base))
            result.append(factory);
    }
    return result;
}

RkClassFactory* RkPluginMgr::findClassFactory(const QString& className) const
{
    return d->byName.value(className);
}

RkClassFactory* RkPluginMgr::findClassFactory(const RkGUID& guid) const
{
    return guid.isNull() ? nullptr : d->byGuid.value(guid);
}
