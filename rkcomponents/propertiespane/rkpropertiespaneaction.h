#pragma once

#include "panes/rkpaneaction.h"

// Shows and hides the Parameters tab.
class RkPropertiesPaneAction : public RkPaneAction
{
    Q_OBJECT
public:
    RkPropertiesPaneAction();
    ~RkPropertiesPaneAction() override;
};
