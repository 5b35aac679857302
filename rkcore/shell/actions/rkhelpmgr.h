#pragma once

#include "rkcoreglobal.h"

#include <QObject>

class QWidget;
class RkAction;

// Online help: tool tips and status tips of actions and widgets. Owned by RkApp. The help lives on
// the objects themselves, so the operations need no manager object and are static: callers may
// still reach them through rkApp->getHelpMgr().
class RKCORE_EXPORT RkHelpMgr : public QObject
{
    Q_OBJECT
public:
    explicit RkHelpMgr(QObject* parent = nullptr);
    ~RkHelpMgr() override;

    // Tool tip from the action's text (without mnemonics), status tip from its description. The
    // action is remembered, so later changes of its texts update the tips (RkAction does this).
    static void setOnlineHelp(RkAction* action);
    // Registers a widget whose tips are already set (or that has none); the widget's object name
    // is its help topic.
    static void setOnlineHelp(QWidget* widget);
    // Sets the widget's tips: an empty tool tip falls back to the title, an empty status tip to the
    // tool tip.
    static void setOnlineHelp(QWidget* widget, const QString& title, const QString& toolTip,
                              const QString& statusTip, const QString& whatsThis);

    static bool hasOnlineHelp(const QObject* object);
};
