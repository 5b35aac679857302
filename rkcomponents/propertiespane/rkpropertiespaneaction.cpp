#include "rkpropertiespaneaction.h"

#include "actions/rkhelpmgr.h"
#include "app/rkapp.h"

RkPropertiesPaneAction::RkPropertiesPaneAction() : RkPaneAction(QStringLiteral("RkPropertiesPane"))
{
    if (rkApp)
        rkApp->getHelpMgr()->setOnlineHelp(this);
}

RkPropertiesPaneAction::~RkPropertiesPaneAction() = default;
