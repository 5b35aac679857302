#include "rkfullscreenaction.h"

#include "app/rkapp.h"
#include "app/rkmainwindow.h"

RkFullScreenAction::RkFullScreenAction()
    : RkAction(tr("Go Full Screen"), tr("Make the main viewport Full Screen"))
{
}

RkFullScreenAction::~RkFullScreenAction() = default;

QString RkFullScreenAction::getActionGroup() const
{
    return tr("View");
}

QString RkFullScreenAction::getDefaultMenuPath() const
{
    return QStringLiteral("&View");
}

void RkFullScreenAction::executeAction()
{
    RkMainWindow* mainWindow = rkApp ? rkApp->getInterface() : nullptr;
    if (mainWindow)
        mainWindow->goFullScreen();
}
