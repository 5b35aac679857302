#include "rktoolpaneaction.h"

#include "app/rkapp.h"
#include "actions/rkhelpmgr.h"

RkToolPaneAction::RkToolPaneAction() : RkPaneAction(QStringLiteral("RkToolPane"))
{
    if (rkApp)
        rkApp->getHelpMgr()->setOnlineHelp(this);
}

RkToolPaneAction::~RkToolPaneAction() = default;
