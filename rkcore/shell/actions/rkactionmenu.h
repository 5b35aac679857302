#pragma once

#include "rkcoreglobal.h"

#include <QCoreApplication>
#include <QString>

#include <memory>
#include <vector>

class QMenu;

// A menu described by action class names, separators and sub-menus. Panes and viewport tools hand
// these to the host, which builds the real QMenu from them when the menu is shown, taking each
// action from the action manager. Copying copies the whole tree.
class RKCORE_EXPORT RkActionMenu
{
    Q_DECLARE_TR_FUNCTIONS(RkActionMenu)
public:
    enum EntryType { Action, Separator, SubMenu };

    RkActionMenu();
    RkActionMenu(const RkActionMenu& other);
    RkActionMenu& operator=(const RkActionMenu& other);
    virtual ~RkActionMenu();

    // An index of -1, or one past the end, appends; indices out of range are clamped.
    void insertAction(const QString& className, int index = -1);
    void insertSeparator(int index = -1);
    // The menu takes ownership of subMenu.
    void insertMenu(const QString& title, RkActionMenu* subMenu, int index = -1);
    void removeEntry(int index);
    void clear();

    int count() const;
    bool isEmpty() const { return count() == 0; }
    EntryType entryType(int index) const;
    // The action class name of an Action entry, or the title of a SubMenu entry.
    QString entryText(int index) const;
    const RkActionMenu* subMenu(int index) const;

    // Appends the entries to the menu: actions come from the main window's action manager (an
    // unknown class is skipped), sub-menus become nested menus, and separators are dropped where
    // they would lead, trail or double up.
    virtual void buildMenu(QMenu* menu);

private:
    struct Entry;
    std::vector<Entry> m_entries;
};
