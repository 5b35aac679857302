#include "rkapp.h"

#include "rkscene.h"
#include "rkundostack.h"

#include <QScriptEngine>

#include <cstdio>

RkApp* rkApp = nullptr;

struct RkApp::Private {
    RkMainWindow* mainWindow = nullptr;
    std::unique_ptr<QScriptEngine> engine;
};

RkApp::RkApp(QObject* parent) : QObject(parent), d(std::make_unique<Private>())
{
    Q_ASSERT(!rkApp);
    rkApp = this;
    d->engine = std::make_unique<QScriptEngine>();
    rkUndoStack = new RkUndoStack(this);
    rkScene = new RkScene(this);
}

RkApp::~RkApp()
{
    delete rkScene;
    rkScene = nullptr;
    delete rkUndoStack;
    rkUndoStack = nullptr;
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

void RkApp::log(const QString& message)
{
    std::fprintf(stderr, "%s\n", qPrintable(message));
    Q_EMIT logged(message);
}
