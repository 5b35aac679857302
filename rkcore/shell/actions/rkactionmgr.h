#pragma once

#include "rkcoreglobal.h"

#include <QList>
#include <QObject>

#include <memory>

class QMenu;
class QMenuBar;
class RkAction;
class QMainWindow;

// Keeps one instance of every action class, made through the class factories on first use, and
// lays the actions out in the main window's menus and tool bars. Owned by the main window.
class RKCORE_EXPORT RkActionMgr : public QObject
{
    Q_OBJECT
public:
    explicit RkActionMgr(QMainWindow* mainWindow);
    ~RkActionMgr() override;

    // The action manager of the newest main window still alive (the one rkApp->getInterface()
    // answers), or null. Lets the parts below the main window reach it.
    static RkActionMgr* current();

    // The action of that class, created through its factory the first time. An unknown class, or
    // a factory that makes no RkAction, gives null and one log line (once per class name).
    RkAction* findAction(const QString& className);
    // Adopts an action made by the host itself (one without a factory); the manager owns it.
    void addAction(RkAction* action);
    QList<RkAction*> getActions() const;

    // Adds the action of that class to the menu; false when there is no such action.
    bool addActionToMenu(const QString& className, QMenu* menu);

    // Creates the action of every registered class that derives from RkAction, then puts each
    // action with a default menu path into that menu of the main window (menus and sub-menus made
    // as needed, actions sorted by group then text inside a menu) and on its default tool bar.
    // Actions already placed stay where they are, so this may run again after loading a module.
    void buildMenus();

    // The menu at a path such as "&Window/&Panes" in the main window's menu bar, created when
    // 'create' is set. Path parts match with or without their mnemonic '&'.
    QMenu* findMenu(const QString& path, bool create = true);

private:
    void adopt(RkAction* action);

    struct Private;
    std::unique_ptr<Private> d;
};
