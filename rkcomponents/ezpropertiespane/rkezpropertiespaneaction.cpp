#include "rkezpropertiespaneaction.h"

#include "actions/rkhelpmgr.h"
#include "app/rkapp.h"

RkEzPropertiesPaneAction::RkEzPropertiesPaneAction()
    : RkPaneAction(QStringLiteral("RkEzPropertiesPane"))
{
    if (rkApp)
        rkApp->getHelpMgr()->setOnlineHelp(this);
}

RkEzPropertiesPaneAction::~RkEzPropertiesPaneAction() = default;
