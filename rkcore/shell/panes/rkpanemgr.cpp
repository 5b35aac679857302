#include "panes/rkpanemgr.h"

#include "log/rklog.h"
#include "panes/rkpane.h"
#include "panes/rkpanesettings.h"
#include "plugin/rkclassfactory.h"
#include "plugin/rkpluginmgr.h"

#include <QAction>
#include <QDockWidget>
#include <QHBoxLayout>
#include <QLabel>
#include <QMainWindow>
#include <QMenu>
#include <QPointer>
#include <QSettings>
#include <QStyle>
#include <QToolButton>

namespace
{
// The dock's title bar: the pane's label, a button with the pane's options menu and a close button.
QWidget* makeTitleBar(QDockWidget* dock, RkPane* pane)
{
    auto* bar = new QWidget(dock);
    bar->setObjectName(QStringLiteral("PaneTitleBar"));
    auto* layout = new QHBoxLayout(bar);
    const int m = bar->style()->pixelMetric(QStyle::PM_CustomBase);
    layout->setContentsMargins(m, m / 2, m / 2, m / 2);
    layout->setSpacing(m);
    auto* title = new QLabel(pane->getLabel(), bar);
    title->setObjectName(QStringLiteral("PaneTitle"));
    layout->addWidget(title, 1);

    auto* options = new QToolButton(bar);
    options->setObjectName(QStringLiteral("PaneOptionsButton"));
    options->setText(RkPaneMgr::tr("Options"));
    options->setToolTip(RkPaneMgr::tr("Options of the %1 pane").arg(pane->getLabel()));
    options->setAutoRaise(true);
    options->setPopupMode(QToolButton::InstantPopup);
    options->setArrowType(Qt::DownArrow);
    // The arrow already says "menu"; the style's extra indicator would only crowd the title bar.
    options->setStyleSheet(QStringLiteral("QToolButton::menu-indicator { image: none; }"));
    auto* menu = new QMenu(options);
    menu->setObjectName(QStringLiteral("PaneOptionsMenu"));
    QPointer<RkPane> watched(pane);
    QObject::connect(menu, &QMenu::aboutToShow, menu, [menu, watched] {
        menu->clear();
        if (watched)
            watched->fillOptionsMenu(menu);
        if (menu->isEmpty())
            menu->addAction(RkPaneMgr::tr("(no options)"))->setEnabled(false);
    });
    options->setMenu(menu);
    layout->addWidget(options);

    auto* close = new QToolButton(bar);
    close->setObjectName(QStringLiteral("PaneCloseButton"));
    close->setAutoRaise(true);
    close->setIcon(bar->style()->standardIcon(QStyle::SP_TitleBarCloseButton));
    close->setToolTip(RkPaneMgr::tr("Close"));
    QObject::connect(close, &QToolButton::clicked, dock, &QDockWidget::close);
    layout->addWidget(close);
    return bar;
}
} // namespace

struct RkPaneMgr::Private {
    QMainWindow* mainWindow = nullptr;
    QList<QPointer<RkPane>> panes;
    QString settingsFile;
};

namespace
{
QPointer<RkPaneMgr> currentMgr;
}

RkPaneMgr::RkPaneMgr(QMainWindow* mainWindow) : QObject(mainWindow), d(std::make_unique<Private>())
{
    d->mainWindow = mainWindow;
    currentMgr = this;
}

RkPaneMgr::~RkPaneMgr() = default;

RkPaneMgr* RkPaneMgr::current()
{
    return currentMgr;
}

RkPane* RkPaneMgr::findPane(const QString& className) const
{
    for (const QPointer<RkPane>& pane : d->panes) {
        if (pane && className == QLatin1String(pane->metaObject()->className()))
            return pane;
    }
    return nullptr;
}

RkPane* RkPaneMgr::createPane(const QString& className)
{
    if (RkPane* existing = findPane(className))
        return existing;
    RkPluginMgr* registry = RkPluginMgr::instance();
    RkClassFactory* factory = registry ? registry->findClassFactory(className) : nullptr;
    QObject* object = factory ? factory->createInstance() : nullptr;
    auto* pane = qobject_cast<RkPane*>(object);
    if (!pane) {
        delete object;
        rkLog(tr("Unknown pane class %1: not shown").arg(className));
        return nullptr;
    }
    addPane(pane);
    return pane;
}

void RkPaneMgr::addPane(RkPane* pane)
{
    if (!pane || d->panes.contains(pane))
        return;
    d->panes.append(pane);
    RkPaneSettings settings(QString::fromLatin1(pane->metaObject()->className()));
    {
        std::unique_ptr<QSettings> store = openStore();
        settings.load(*store);
    }
    pane->restoreSettings(settings);
    dockPane(pane);
    Q_EMIT paneCreated(pane);
}

void RkPaneMgr::createPanes()
{
    RkPluginMgr* registry = RkPluginMgr::instance();
    if (!registry)
        return;
    const auto factories = registry->getClassFactories(&RkPane::staticMetaObject);
    for (RkClassFactory* factory : factories)
        createPane(factory->className());
}

QList<RkPane*> RkPaneMgr::getPanes() const
{
    QList<RkPane*> result;
    for (const QPointer<RkPane>& pane : d->panes) {
        if (pane)
            result.append(pane);
    }
    return result;
}

QDockWidget* RkPaneMgr::getDockWidget(const RkPane* pane) const
{
    return pane ? qobject_cast<QDockWidget*>(pane->parentWidget()) : nullptr;
}

QDockWidget* RkPaneMgr::dockPane(RkPane* pane)
{
    const QString className = QString::fromLatin1(pane->metaObject()->className());
    QDockWidget* firstDock = nullptr;
    for (RkPane* other : getPanes()) {
        QDockWidget* otherDock = getDockWidget(other);
        if (other != pane && otherDock &&
            d->mainWindow->dockWidgetArea(otherDock) == Qt::RightDockWidgetArea) {
            firstDock = otherDock;
            break;
        }
    }
    auto* dock = new QDockWidget(pane->getLabel(), d->mainWindow);
    dock->setObjectName(className + QStringLiteral("Dock"));
    dock->setWidget(pane);
    dock->setTitleBarWidget(makeTitleBar(dock, pane));
    d->mainWindow->addDockWidget(Qt::RightDockWidgetArea, dock);
    // Panes share one tabbed dock; the first one docked stays the tab in front.
    if (firstDock) {
        d->mainWindow->tabifyDockWidget(firstDock, dock);
        firstDock->raise();
    }
    connect(dock->toggleViewAction(), &QAction::toggled, this,
            [this, className](bool visible) { Q_EMIT paneVisibilityChanged(className, visible); });
    return dock;
}

void RkPaneMgr::showPane(const QString& className, bool show)
{
    RkPane* pane = show ? createPane(className) : findPane(className);
    QDockWidget* dock = getDockWidget(pane);
    if (!dock)
        return;
    if (show) {
        dock->show();
        dock->raise();
    } else {
        dock->close();
    }
}

bool RkPaneMgr::isPaneVisible(const QString& className) const
{
    QDockWidget* dock = getDockWidget(findPane(className));
    return dock && dock->toggleViewAction()->isChecked();
}

void RkPaneMgr::saveSettings()
{
    std::unique_ptr<QSettings> store = openStore();
    for (RkPane* pane : getPanes()) {
        RkPaneSettings settings(QString::fromLatin1(pane->metaObject()->className()));
        settings.load(*store);
        pane->saveSettings(settings);
        settings.store(*store);
    }
    store->sync();
}

void RkPaneMgr::setSettingsFile(const QString& filePath)
{
    d->settingsFile = filePath;
}

std::unique_ptr<QSettings> RkPaneMgr::openStore() const
{
    if (!d->settingsFile.isEmpty())
        return std::make_unique<QSettings>(d->settingsFile, QSettings::IniFormat);
    return std::make_unique<QSettings>(QSettings::IniFormat, QSettings::UserScope,
                                       QStringLiteral("rkhost"), QStringLiteral("panes"));
}
