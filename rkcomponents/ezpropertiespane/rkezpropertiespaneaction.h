#pragma once

#include "panes/rkpaneaction.h"

// Shows and hides the Shape tab.
class RkEzPropertiesPaneAction : public RkPaneAction
{
    Q_OBJECT
public:
    RkEzPropertiesPaneAction();
    ~RkEzPropertiesPaneAction() override;
};
