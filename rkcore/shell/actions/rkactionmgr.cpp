#include "actions/rkactionmgr.h"

#include "actions/rkaction.h"
#include "log/rklog.h"
#include "plugin/rkclassfactory.h"
#include "plugin/rkpluginmgr.h"

#include <QHash>
#include <QMainWindow>
#include <QMenu>
#include <QMenuBar>
#include <QPointer>
#include <QSet>
#include <QToolBar>

#include <algorithm>

namespace
{
QString withoutMnemonic(QString text)
{
    text.remove(QLatin1Char('&'));
    return text;
}

QMenu* findSubMenu(const QList<QAction*>& actions, const QString& title)
{
    for (QAction* a : actions) {
        if (a->menu() && withoutMnemonic(a->text()) == withoutMnemonic(title))
            return a->menu();
    }
    return nullptr;
}
} // namespace

struct RkActionMgr::Private {
    QMainWindow* mainWindow = nullptr;
    QHash<QString, QPointer<RkAction>> actions;
    QList<QPointer<RkAction>> order;
    QSet<QString> reportedMissing;
    QSet<RkAction*> placed;
};

namespace
{
QPointer<RkActionMgr> currentMgr;
}

RkActionMgr::RkActionMgr(QMainWindow* mainWindow)
    : QObject(mainWindow), d(std::make_unique<Private>())
{
    d->mainWindow = mainWindow;
    currentMgr = this;
}

RkActionMgr::~RkActionMgr() = default;

RkActionMgr* RkActionMgr::current()
{
    return currentMgr;
}

RkAction* RkActionMgr::findAction(const QString& className)
{
    if (RkAction* existing = d->actions.value(className))
        return existing;
    RkPluginMgr* registry = RkPluginMgr::instance();
    RkClassFactory* factory = registry ? registry->findClassFactory(className) : nullptr;
    QObject* object = factory ? factory->createInstance() : nullptr;
    auto* action = qobject_cast<RkAction*>(object);
    if (!action) {
        delete object;
        if (!d->reportedMissing.contains(className)) {
            d->reportedMissing.insert(className);
            rkLog(factory ? tr("Action class %1 makes no action: skipped").arg(className)
                          : tr("Unknown action class %1: skipped").arg(className));
        }
        return nullptr;
    }
    adopt(action);
    action->init();
    return action;
}

void RkActionMgr::addAction(RkAction* action)
{
    if (!action || d->actions.value(action->metaObject()->className()))
        return;
    adopt(action);
    action->init();
}

void RkActionMgr::adopt(RkAction* action)
{
    // Parented to the main window so that shortcuts work wherever focus is in it.
    action->setParent(d->mainWindow);
    // Scripts and tests find an action by its class name.
    if (action->objectName().isEmpty())
        action->setObjectName(QString::fromLatin1(action->metaObject()->className()));
    if (action->shortcut().isEmpty() && !action->getDefaultAccel().isEmpty())
        action->setShortcut(action->getDefaultAccel());
    d->actions.insert(QString::fromLatin1(action->metaObject()->className()), action);
    d->order.append(action);
}

QList<RkAction*> RkActionMgr::getActions() const
{
    QList<RkAction*> result;
    for (const QPointer<RkAction>& a : d->order) {
        if (a)
            result.append(a);
    }
    return result;
}

bool RkActionMgr::addActionToMenu(const QString& className, QMenu* menu)
{
    RkAction* action = findAction(className);
    if (!action || !menu)
        return false;
    menu->addAction(action);
    return true;
}

void RkActionMgr::buildMenus()
{
    if (RkPluginMgr* registry = RkPluginMgr::instance()) {
        const auto factories = registry->getClassFactories(&RkAction::staticMetaObject);
        for (RkClassFactory* factory : factories)
            findAction(factory->className());
    }
    QHash<QMenu*, QList<RkAction*>> byMenu;
    QList<QMenu*> menus;
    for (RkAction* action : getActions()) {
        if (d->placed.contains(action))
            continue;
        const QString path = action->getDefaultMenuPath();
        if (!path.isEmpty()) {
            QMenu* menu = findMenu(path, true);
            if (!byMenu.contains(menu))
                menus.append(menu);
            byMenu[menu].append(action);
        }
        const QString toolBarName = action->getDefaultToolBar();
        if (!toolBarName.isEmpty() && d->mainWindow) {
            QToolBar* toolBar = d->mainWindow->findChild<QToolBar*>(toolBarName);
            if (!toolBar) {
                toolBar = d->mainWindow->addToolBar(toolBarName);
                toolBar->setObjectName(toolBarName);
            }
            toolBar->addAction(action);
        }
        d->placed.insert(action);
    }
    for (QMenu* menu : menus) {
        QList<RkAction*>& list = byMenu[menu];
        std::stable_sort(list.begin(), list.end(), [](RkAction* a, RkAction* b) {
            const QString ga = a->getActionGroup(), gb = b->getActionGroup();
            if (ga != gb)
                return ga < gb;
            return withoutMnemonic(a->text()).localeAwareCompare(withoutMnemonic(b->text())) < 0;
        });
        // Plain entries go above the sub-menus of the same menu.
        QAction* firstSubMenu = nullptr;
        for (QAction* a : menu->actions()) {
            if (a->menu()) {
                firstSubMenu = a;
                break;
            }
        }
        for (RkAction* action : list)
            menu->insertAction(firstSubMenu, action);
    }
}

QMenu* RkActionMgr::findMenu(const QString& path, bool create)
{
    if (!d->mainWindow)
        return nullptr;
    const QStringList parts = path.split(QLatin1Char('/'), Qt::SkipEmptyParts);
    if (parts.isEmpty())
        return nullptr;
    QMenuBar* bar = d->mainWindow->menuBar();
    QMenu* menu = findSubMenu(bar->actions(), parts.first());
    if (!menu) {
        if (!create)
            return nullptr;
        menu = bar->addMenu(parts.first());
    }
    for (int i = 1; i < parts.size(); ++i) {
        QMenu* sub = findSubMenu(menu->actions(), parts.at(i));
        if (!sub) {
            if (!create)
                return nullptr;
            sub = menu->addMenu(parts.at(i));
        }
        menu = sub;
    }
    return menu;
}
