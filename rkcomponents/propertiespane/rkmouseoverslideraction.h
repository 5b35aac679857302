#pragma once

#include "actions/rkaction.h"

// Mouse-Over Slider: a switch of the Parameters tab whose check mark follows the pane.
class RkMouseOverSliderAction : public RkAction
{
    Q_OBJECT
public:
    RkMouseOverSliderAction();
    ~RkMouseOverSliderAction() override;

    QString getActionGroup() const override;
    void init() override;
    void executeAction() override;
    // Triggering a checkable action comes here: it toggles the pane the same way.
    void toggleAction(bool onOff) override;
};
