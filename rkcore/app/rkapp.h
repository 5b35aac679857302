#pragma once

#include "rkcoreglobal.h"

#include <QObject>

#include <memory>

class QScriptEngine;
class RkMainWindow;
class RkScene;
class RkUndoStack;

// The application core: owns the scene, the undo stack and the script engine, and knows the main
// window when there is one. Exactly one lives at a time; rkApp points at it.
class RKCORE_EXPORT RkApp : public QObject {
    Q_OBJECT
public:
    explicit RkApp(QObject* parent = nullptr);
    ~RkApp() override;

    RkMainWindow* getInterface() const;
    void setInterface(RkMainWindow* mainWindow);

    QScriptEngine* getScriptEngine() const;

    // Writes one line to the host's log and to stderr.
    void log(const QString& message);

Q_SIGNALS:
    void logged(const QString& message);

private:
    struct Private;
    std::unique_ptr<Private> d;
};

RKCORE_EXPORT extern RkApp* rkApp;
