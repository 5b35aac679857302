#include "rktoolpaneaction.h"

#include "actions/rkhelpmgr.h"
#include "app/rkapp.h"

RkToolPaneAction::RkToolPaneAction() : RkPaneAction(QStringLiteral("RkToolPane"))
{
    if (rkApp)
        rkApp->getHelpMgr()->setOnlineHelp(this);
}

RkToolPaneAction::~RkToolPaneAction() = default;
