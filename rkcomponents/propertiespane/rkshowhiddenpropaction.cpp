#include "rkshowhiddenpropaction.h"

#include "rkpropertiespane.h"

#include <QPointer>

namespace
{

QPointer<RkPropertiesPane> s_pane;

} // namespace

RkShowHiddenPropAction::RkShowHiddenPropAction()
    : RkAction(tr("Show Hidden Properties"),
               tr("Toggle the display of hidden properties in the Parameters tab"))
{
    setCheckable(true);
}

RkShowHiddenPropAction::~RkShowHiddenPropAction() = default;

QString RkShowHiddenPropAction::getActionGroup() const
{
    return tr("Parameters");
}

void RkShowHiddenPropAction::init()
{
    if (RkPropertiesPane* pane = RkPropertiesPane::find(s_pane)) {
        connect(pane, &RkPropertiesPane::showingHiddenChanged, this, &QAction::setChecked);
        setChecked(pane->showingHidden());
    } else {
        qWarning("No RkPropertiesPane instance could be found in RkShowHiddenPropAction::init()");
    }
    RkAction::init();
}

void RkShowHiddenPropAction::executeAction()
{
    if (RkPropertiesPane* pane = RkPropertiesPane::find(s_pane))
        pane->toggleShowHidden();
    else
        qWarning("No RkPropertiesPane instance could be found in "
                 "RkShowHiddenPropAction::executeAction()");
}

void RkShowHiddenPropAction::toggleAction(bool)
{
    executeAction();
}
