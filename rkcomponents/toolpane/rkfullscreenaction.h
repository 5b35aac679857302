#pragma once

#include "actions/rkaction.h"

// View > Go Full Screen: asks the main window to let the main viewport fill the screen.
class RkFullScreenAction : public RkAction
{
    Q_OBJECT
public:
    RkFullScreenAction();
    ~RkFullScreenAction() override;

    QString getActionGroup() const override;
    QString getDefaultMenuPath() const override;
    // Without a main window there is nothing to fill the screen with, and nothing happens.
    void executeAction() override;
};
