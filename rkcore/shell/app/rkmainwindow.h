#pragma once

#include "rkcoreglobal.h"

#include <QMainWindow>

#include <memory>

class QMenu;
class RkActionMgr;
class RkPaneMgr;
class RkViewport;
class RkViewportMgr;

// The host's main window: the main viewport in the centre, panes docked around it, the menus and
// tool bars. While it exists rkApp->getInterface() answers it.
class RKCORE_EXPORT RkMainWindow : public QMainWindow
{
    Q_OBJECT
public:
    explicit RkMainWindow(QWidget* parent = nullptr);
    ~RkMainWindow() override;

    RkPaneMgr* getPaneMgr() const;
    RkActionMgr* getActionMgr() const;
    RkViewportMgr* getViewportMgr() const;

    // The central viewport; it is also the first, active viewport of the viewport manager.
    RkViewport* getMainViewport() const;
    // Sets the widget that draws the scene in the main viewport (the viewport owns it).
    void setSceneWidget(QWidget* widget);

    // The menu at a path such as "&File" or "&Window/&Panes", made when missing. Menus appear in
    // the menu bar in the order they are first asked for.
    QMenu* addMenu(const QString& path);

    // Makes the main viewport fill the screen: menus, tool bars, docks and status bar go away and
    // the window covers the screen. Esc (or leaveFullScreen()) brings everything back. Calling it
    // again while full screen changes nothing.
    void goFullScreen();
    void leaveFullScreen();
    bool isFullScreenMode() const;

Q_SIGNALS:
    void fullScreenChanged(bool fullScreen);

protected:
    void closeEvent(QCloseEvent* event) override;
    // Tells every action of the action manager when the style changes, so icons follow it.
    void changeEvent(QEvent* event) override;

private:
    struct Private;
    std::unique_ptr<Private> d;
};
