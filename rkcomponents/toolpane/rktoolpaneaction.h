#pragma once

#include "panes/rkpaneaction.h"

// Shows and hides the Tool tab.
class RkToolPaneAction : public RkPaneAction
{
    Q_OBJECT
public:
    RkToolPaneAction();
    ~RkToolPaneAction() override;
};
