#include "rkuvviewaction.h"

#include "app/rkapp.h"
#include "app/rkmainwindow.h"
#include "rkuvview.h"
#include "viewport/rkviewport.h"
#include "viewport/rkviewportmgr.h"

RkUVViewAction::RkUVViewAction() : RkAction(tr("UV View"), tr("Show UV View")) {}

RkUVViewAction::~RkUVViewAction() = default;

QString RkUVViewAction::getActionGroup() const
{
    return tr("View Selection");
}

void RkUVViewAction::executeAction()
{
    RkMainWindow* mainWindow = rkApp ? rkApp->getInterface() : nullptr;
    RkViewport* viewport = mainWindow ? mainWindow->getViewportMgr()->getActiveViewport() : nullptr;
    // Without a viewport to show it there is no place for a view: none is made.
    if (!viewport)
        return;
    viewport->setView(new RkUVView); // the viewport owns the view from here on
}
