#pragma once

#include "actions/rkaction.h"

// Puts a new UV view into the active viewport of the main window.
class RkUVViewAction : public RkAction
{
    Q_OBJECT
public:
    RkUVViewAction();
    ~RkUVViewAction() override;

    QString getActionGroup() const override;
    void executeAction() override;
};
