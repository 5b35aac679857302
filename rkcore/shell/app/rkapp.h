#pragma once

#include "rkcoreglobal.h"

#include <QObject>

#include <memory>

class QScriptEngine;
class RkClassFactory;
class RkGUID;
class RkHelpMgr;
class RkMainWindow;
class RkPluginMgr;
class RkScene;
class RkUndoStack;

// The application core: owns the scene, the undo stack, the script engine, the plug-in manager and
// the help manager, and knows the main window when there is one. Exactly one lives at a time;
// rkApp points at it.
class RKCORE_EXPORT RkApp : public QObject
{
    Q_OBJECT
public:
    explicit RkApp(QObject* parent = nullptr);
    ~RkApp() override;

    // The main window, or null when the application runs without one.
    RkMainWindow* getInterface() const;
    void setInterface(RkMainWindow* mainWindow);

    QScriptEngine* getScriptEngine() const;
    RkPluginMgr* getPluginMgr() const;
    RkHelpMgr* getHelpMgr() const;

    // True once start-up has finished and the event loop runs; panes post no refreshes before.
    bool isRunning() const;
    void setRunning(bool running);

    // Writes one line to the host's log and to stderr; rkLog() from the lower layers ends here too.
    void log(const QString& message);
    // Every line logged so far, oldest first.
    QStringList getLog() const;

    // Nested: every setBusyCursor() needs one clearBusyCursor(); extra clears are ignored.
    static void setBusyCursor();
    static void clearBusyCursor();

    // The factory of a registered class, or null (also when no RkApp exists).
    static RkClassFactory* findClassFactory(const QString& className);
    static RkClassFactory* findClassFactory(const RkGUID& guid);

    // Objects that must live until the application ends; deleted by ~RkApp, last registered first.
    void registerStaticObject(QObject* object);

Q_SIGNALS:
    void logged(const QString& message);

private:
    struct Private;
    std::unique_ptr<Private> d;
};

RKCORE_EXPORT extern RkApp* rkApp;

// Hands an object to the application to delete at shut-down (see RkApp::registerStaticObject).
// Without an application the object is deleted with the application instance of Qt.
RKCORE_EXPORT void rkRegisterStaticObject(QObject* object);
