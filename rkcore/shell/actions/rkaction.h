#pragma once

#include "rkcoreglobal.h"

#include <QAction>
#include <QKeySequence>

#include <memory>

// Base of every host and module action. The action manager creates actions through their class
// factories, calls init(), and lists them in the main menus under getDefaultMenuPath(). Triggering
// runs executeAction(), or toggleAction(checked) for a checkable action.
class RKCORE_EXPORT RkAction : public QAction
{
    Q_OBJECT
public:
    RkAction(const QString& text, const QString& description, QObject* parent = nullptr);
    ~RkAction() override;

    QString getDescription() const;
    void setDescription(const QString& description);

    virtual void setEnabled(bool enabled);
    // The group that lists the action in the host's action catalogue; default "Miscellaneous".
    virtual QString getActionGroup() const;
    // Main-menu path, sub-menus separated by '/', for example "&Window/&Panes". Empty (the
    // default): the action is in no main menu.
    virtual QString getDefaultMenuPath() const;
    // Name of the tool bar the action goes on; empty (the default): none.
    virtual QString getDefaultToolBar() const;
    virtual QKeySequence getDefaultAccel() const;
    // Called once by the action manager after creation, when the main window exists.
    virtual void init();
    // Called when the application style changes; icons are refreshed here.
    virtual void styleChange();
    // Re-applies the online help texts (tool tip, status tip) from the current text.
    virtual void updateOnlineHelp();
    virtual void executeAction();
    virtual void toggleAction(bool onOff);

private:
    struct Private;
    std::unique_ptr<Private> d;
};
