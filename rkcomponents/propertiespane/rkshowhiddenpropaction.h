#pragma once

#include "actions/rkaction.h"

// Show Hidden Properties: a switch of the Parameters tab whose check mark follows the pane.
class RkShowHiddenPropAction : public RkAction
{
    Q_OBJECT
public:
    RkShowHiddenPropAction();
    ~RkShowHiddenPropAction() override;

    QString getActionGroup() const override;
    void init() override;
    void executeAction() override;
    // Triggering a checkable action comes here: it toggles the pane the same way.
    void toggleAction(bool onOff) override;
};
