#include "app/rkapp.h"

#include "actions/rkhelpmgr.h"
#include "import/rkimporter.h"
#include "log/rklog.h"
#include "plugin/rkpluginmgr.h"
#include "scene/rkscene.h"
#include "scene/rksceneclasses.h"
#include "undo/rkundostack.h"
#include "widgets/rkwidgetclasses.h"

#include <QApplication>
#include <QCoreApplication>
#include <QPointer>
#include <QScriptContext>
#include <QScriptEngine>
#include <QStringList>

#include <cstdio>

RkApp* rkApp = nullptr;

namespace
{
int busyCursorDepth = 0;

// print() in scripts writes one line to stdout, its arguments separated by spaces.
QScriptValue scriptPrint(QScriptContext* context, QScriptEngine* engine)
{
    QStringList parts;
    for (int i = 0; i < context->argumentCount(); ++i)
        parts.append(context->argument(i).toString());
    std::fprintf(stdout, "%s\n", parts.join(QLatin1Char(' ')).toLocal8Bit().constData());
    std::fflush(stdout);
    return engine->undefinedValue();
}
} // namespace

struct RkApp::Private {
    RkMainWindow* mainWindow = nullptr;
    std::unique_ptr<QScriptEngine> engine;
    RkPluginMgr* pluginMgr = nullptr;
    RkHelpMgr* helpMgr = nullptr;
    bool running = false;
    QStringList logLines;
    QList<QPointer<QObject>> staticObjects;
};

RkApp::RkApp(QObject* parent) : QObject(parent), d(std::make_unique<Private>())
{
    Q_ASSERT(!rkApp);
    rkApp = this;
    d->engine = std::make_unique<QScriptEngine>();
    d->engine->globalObject().setProperty(QStringLiteral("print"),
                                          d->engine->newFunction(scriptPrint));
    d->pluginMgr = new RkPluginMgr(d->engine.get(), this);
    for (RkClassFactory* factory : rkSceneClassFactories())
        d->pluginMgr->addClassFactory(factory);
    for (RkClassFactory* factory : rkWidgetClassFactories())
        d->pluginMgr->addClassFactory(factory);
    rkSetLogHandler([this](const QString& line) { log(line); });
    d->helpMgr = new RkHelpMgr(this);
    rkUndoStack = new RkUndoStack(this);
    rkScene = new RkScene(this);
    // Imported models are rebuilt from their files whenever a scene is loaded.
    RkImporter::registerFileSource();
}

RkApp::~RkApp()
{
    rkSetLogHandler(nullptr);
    while (!d->staticObjects.isEmpty())
        delete d->staticObjects.takeLast().data();
    delete rkScene;
    rkScene = nullptr;
    delete rkUndoStack;
    rkUndoStack = nullptr;
    // Script wrappers may refer to module classes; the engine goes before the plug-in manager.
    d->engine.reset();
    rkApp = nullptr;
}

RkMainWindow* RkApp::getInterface() const
{
    return d->mainWindow;
}

void RkApp::setInterface(RkMainWindow* mainWindow)
{
    d->mainWindow = mainWindow;
}

QScriptEngine* RkApp::getScriptEngine() const
{
    return d->engine.get();
}

RkPluginMgr* RkApp::getPluginMgr() const
{
    return d->pluginMgr;
}

RkHelpMgr* RkApp::getHelpMgr() const
{
    return d->helpMgr;
}

bool RkApp::isRunning() const
{
    return d->running;
}

void RkApp::setRunning(bool running)
{
    d->running = running;
}

void RkApp::log(const QString& message)
{
    d->logLines.append(message);
    std::fprintf(stderr, "%s\n", qPrintable(message));
    Q_EMIT logged(message);
}

QStringList RkApp::getLog() const
{
    return d->logLines;
}

void RkApp::setBusyCursor()
{
    if (!qobject_cast<QApplication*>(QCoreApplication::instance()))
        return;
    ++busyCursorDepth;
    QApplication::setOverrideCursor(Qt::WaitCursor);
}

void RkApp::clearBusyCursor()
{
    if (busyCursorDepth == 0)
        return;
    --busyCursorDepth;
    QApplication::restoreOverrideCursor();
}

RkClassFactory* RkApp::findClassFactory(const QString& className)
{
    RkPluginMgr* registry = RkPluginMgr::instance();
    return registry ? registry->findClassFactory(className) : nullptr;
}

RkClassFactory* RkApp::findClassFactory(const RkGUID& guid)
{
    RkPluginMgr* registry = RkPluginMgr::instance();
    return registry ? registry->findClassFactory(guid) : nullptr;
}

void RkApp::registerStaticObject(QObject* object)
{
    if (object)
        d->staticObjects.append(object);
}

void rkRegisterStaticObject(QObject* object)
{
    if (!object)
        return;
    if (rkApp)
        rkApp->registerStaticObject(object);
    else if (QCoreApplication::instance())
        object->setParent(QCoreApplication::instance());
}
