#include "rkpluginmgr.h"

#include "rkapp.h"
#include "rkclassfactory.h"
#include "rkguid.h"
#include "rkplugin.h"

#include <QDir>
#include <QFileInfo>
#include <QHash>
#include <QLibrary>
#include <QPointer>
#include <QScriptEngine>

namespace {
using SDKVersionFn = quint32 (*)();
using PluginDefinitionFn = RkPlugin* (*)();

void logLine(const QString& line)
{
    if (rkApp)
        rkApp->log(line);
    else
        qWarning("%s", qPrintable(line));
}
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
}

RkPluginMgr::~RkPluginMgr() = default;

bool RkPluginMgr::loadModule(const QString& filePath)
{
    const QString name = QFileInfo(filePath).fileName();
    // Loaded libraries are never unloaded after success (see the class comment), so the QLibrary
    // object itself may go; only a refused module is unloaded again.
    QLibrary library(filePath);
    if (!library.load()) {
        logLine(tr("Plug-in %1 not loaded: %2").arg(name, library.errorString()));
        return false;
    }
    auto sdkVersion = reinterpret_cast<SDKVersionFn>(library.resolve("getSDKVersion"));
    auto definition = reinterpret_cast<PluginDefinitionFn>(library.resolve("getPluginDefinition"));
    QString refusal;
    RkPlugin* plugin = nullptr;
    if (!sdkVersion || !definition) {
        refusal = tr("Plug-in %1 refused: it lacks the entry point %2")
                      .arg(name, QLatin1String(!sdkVersion ? "getSDKVersion"
                                                           : "getPluginDefinition"));
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
        logLine(refusal);
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
        logLine(tr("Plug-in folder %1 does not exist").arg(dirPath));
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
        const QString className = factory->className();
        if (d->byName.contains(className) || d->byGuid.contains(factory->getGUID())) {
            logLine(tr("Class %1 of plug-in %2 skipped: its name or GUID is already registered")
                        .arg(className, plugin->getName()));
            continue;
        }
        d->factories.append(factory);
        d->byName.insert(className, factory);
        if (!factory->getGUID().isNull())
            d->byGuid.insert(factory->getGUID(), factory);
        if (d->engine)
            factory->registerClass(d->engine);
    }
    Q_EMIT pluginAdded(plugin);
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
