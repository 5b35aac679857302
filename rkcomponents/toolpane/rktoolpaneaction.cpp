#include "rktoolpaneaction.h"

#include "rkapp.h"
#include "rkhelpmgr.h"

RkToolPaneAction::RkToolPaneAction() : RkPaneAction(QStringLiteral("RkToolPane"))
{
    if (rkApp)
        rkApp->getHelpMgr()->setOnlineHelp(this);
}

RkToolPaneAction::~RkToolPaneAction() = default;
