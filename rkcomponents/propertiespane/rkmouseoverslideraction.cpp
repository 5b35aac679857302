#include "rkmouseoverslideraction.h"

#include "rkpropertiespane.h"

#include <QPointer>

namespace
{

QPointer<RkPropertiesPane> s_pane;

} // namespace

RkMouseOverSliderAction::RkMouseOverSliderAction()
    : RkAction(tr("Mouse-Over Slider"), tr("Hide the sliders until the mouse is over them."))
{
    setCheckable(true);
}

RkMouseOverSliderAction::~RkMouseOverSliderAction() = default;

QString RkMouseOverSliderAction::getActionGroup() const
{
    return tr("Parameters");
}

void RkMouseOverSliderAction::init()
{
    if (RkPropertiesPane* pane = RkPropertiesPane::find(s_pane)) {
        connect(pane, &RkPropertiesPane::mouseOverSliderChanged, this, &QAction::setChecked);
        setChecked(pane->isSliderMouseOver());
    } else {
        qWarning("No RkPropertiesPane instance could be found in RkMouseOverSliderAction::init()");
    }
    RkAction::init();
}

void RkMouseOverSliderAction::executeAction()
{
    if (RkPropertiesPane* pane = RkPropertiesPane::find(s_pane))
        pane->toggleMouseOverSlider();
    else
        qWarning("No RkPropertiesPane instance could be found in "
                 "RkMouseOverSliderAction::executeAction()");
}

void RkMouseOverSliderAction::toggleAction(bool)
{
    executeAction();
}
