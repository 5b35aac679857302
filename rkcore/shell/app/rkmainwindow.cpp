#include "app/rkmainwindow.h"

#include "actions/rkaction.h"
#include "actions/rkactionmgr.h"
#include "app/rkapp.h"
#include "panes/rkpanemgr.h"
#include "viewport/rkviewport.h"
#include "viewport/rkviewportmgr.h"

#include <QDockWidget>
#include <QEvent>
#include <QMenuBar>
#include <QPointer>
#include <QScreen>
#include <QShortcut>
#include <QStatusBar>
#include <QToolBar>

struct RkMainWindow::Private {
    RkPaneMgr* paneMgr = nullptr;
    RkActionMgr* actionMgr = nullptr;
    RkViewportMgr* viewportMgr = nullptr;
    RkViewport* mainViewport = nullptr;
    QShortcut* leaveShortcut = nullptr;

    // What full screen hid, to bring back exactly that.
    bool fullScreen = false;
    Qt::WindowStates stateBefore;
    QRect geometryBefore;
    bool menuBarWasVisible = true;
    bool statusBarWasVisible = true;
    QList<QPointer<QWidget>> hiddenBars;
};

RkMainWindow::RkMainWindow(QWidget* parent) : QMainWindow(parent), d(std::make_unique<Private>())
{
    setObjectName(QStringLiteral("RkMainWindow"));
    d->paneMgr = new RkPaneMgr(this);
    d->actionMgr = new RkActionMgr(this);
    d->viewportMgr = new RkViewportMgr(this);
    d->mainViewport = new RkViewport(this);
    setCentralWidget(d->mainViewport);
    d->viewportMgr->addViewport(d->mainViewport);
    addToolBar(Qt::TopToolBarArea, d->viewportMgr->getToolBar());
    setDockNestingEnabled(true);
    setDockOptions(dockOptions() | QMainWindow::AllowTabbedDocks);

    d->leaveShortcut = new QShortcut(QKeySequence(Qt::Key_Escape), this);
    d->leaveShortcut->setContext(Qt::WindowShortcut);
    d->leaveShortcut->setEnabled(false);
    connect(d->leaveShortcut, &QShortcut::activated, this, &RkMainWindow::leaveFullScreen);

    statusBar()->setObjectName(QStringLiteral("StatusBar"));
    if (rkApp) {
        rkApp->setInterface(this);
        connect(rkApp, &RkApp::logged, statusBar(),
                [this](const QString& line) { statusBar()->showMessage(line, 10000); });
    }
}

RkMainWindow::~RkMainWindow()
{
    d->paneMgr->saveSettings();
    if (rkApp && rkApp->getInterface() == this)
        rkApp->setInterface(nullptr);
    // Panes and actions go with their Qt parents; panes may still ask rkApp->getInterface() while
    // they go, and get null.
}

RkPaneMgr* RkMainWindow::getPaneMgr() const
{
    return d->paneMgr;
}

RkActionMgr* RkMainWindow::getActionMgr() const
{
    return d->actionMgr;
}

RkViewportMgr* RkMainWindow::getViewportMgr() const
{
    return d->viewportMgr;
}

RkViewport* RkMainWindow::getMainViewport() const
{
    return d->mainViewport;
}

void RkMainWindow::setSceneWidget(QWidget* widget)
{
    d->mainViewport->setViewWidget(widget);
}

QMenu* RkMainWindow::addMenu(const QString& path)
{
    return d->actionMgr->findMenu(path, true);
}

void RkMainWindow::goFullScreen()
{
    if (d->fullScreen)
        return;
    d->fullScreen = true;
    d->stateBefore = windowState();
    d->geometryBefore = geometry();
    d->menuBarWasVisible = menuBar()->isVisible() || !isVisible();
    d->statusBarWasVisible = statusBar()->isVisible() || !isVisible();
    d->hiddenBars.clear();
    const auto docks = findChildren<QDockWidget*>(QString(), Qt::FindDirectChildrenOnly);
    for (QDockWidget* dock : docks) {
        if (!dock->isHidden()) {
            d->hiddenBars.append(dock);
            dock->hide();
        }
    }
    const auto bars = findChildren<QToolBar*>(QString(), Qt::FindDirectChildrenOnly);
    for (QToolBar* bar : bars) {
        if (!bar->isHidden()) {
            d->hiddenBars.append(bar);
            bar->hide();
        }
    }
    menuBar()->hide();
    statusBar()->hide();
    d->leaveShortcut->setEnabled(true);
    showFullScreen();
    // Without a window manager nothing resizes a full-screen window; cover the screen ourselves.
    if (QScreen* s = screen())
        setGeometry(s->geometry());
    d->mainViewport->setFocus();
    Q_EMIT fullScreenChanged(true);
}

void RkMainWindow::leaveFullScreen()
{
    if (!d->fullScreen)
        return;
    d->fullScreen = false;
    d->leaveShortcut->setEnabled(false);
    setWindowState(d->stateBefore);
    if (!(d->stateBefore & (Qt::WindowMaximized | Qt::WindowFullScreen)))
        setGeometry(d->geometryBefore);
    show();
    menuBar()->setVisible(d->menuBarWasVisible);
    statusBar()->setVisible(d->statusBarWasVisible);
    for (const QPointer<QWidget>& bar : d->hiddenBars) {
        if (bar)
            bar->show();
    }
    d->hiddenBars.clear();
    Q_EMIT fullScreenChanged(false);
}

bool RkMainWindow::isFullScreenMode() const
{
    return d->fullScreen;
}

void RkMainWindow::closeEvent(QCloseEvent* event)
{
    d->paneMgr->saveSettings();
    QMainWindow::closeEvent(event);
}

void RkMainWindow::changeEvent(QEvent* event)
{
    QMainWindow::changeEvent(event);
    if (event->type() == QEvent::StyleChange) {
        for (RkAction* action : d->actionMgr->getActions())
            action->styleChange();
    }
}
