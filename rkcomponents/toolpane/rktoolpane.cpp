#include "rktoolpane.h"

#include "app/rkapp.h"
#include "app/rkmainwindow.h"
#include "rktoolactionmenu.h"
#include "viewport/rkviewportmgr.h"
#include "viewport/rkviewtool.h"

#include <QLabel>
#include <QPointer>
#include <QStackedWidget>
#include <QStyle>
#include <QVBoxLayout>

namespace
{
RkViewportMgr* viewportMgr()
{
    RkMainWindow* mainWindow = rkApp ? rkApp->getInterface() : nullptr;
    return mainWindow ? mainWindow->getViewportMgr() : nullptr;
}
} // namespace

struct RkToolPane::Private {
    QLabel* nameLabel = nullptr;
    QStackedWidget* widgetStack = nullptr;
    // Only kept to disconnect from it at the next rebuild.
    QPointer<RkViewTool> currentTool;
    bool needsRebuild = true;
};

RkToolPane::RkToolPane() : RkPane(tr("Tool")), d(std::make_unique<Private>())
{
    // A pane made without a main window (for example by a script at start-up) has no tools to
    // follow; it shows no tool until refreshed with one.
    if (RkViewportMgr* mgr = viewportMgr())
        connect(mgr, &RkViewportMgr::activeToolSwitched, this, &RkToolPane::toolSwitched);

    auto* layout = new QVBoxLayout(this);
    const int m = style()->pixelMetric(QStyle::PM_CustomBase);
    layout->setContentsMargins(m, m, m, m);
    layout->setSpacing(m);
    layout->setSizeConstraint(QLayout::SetNoConstraint);

    d->nameLabel = new QLabel(this);
    d->nameLabel->setObjectName(QStringLiteral("Tool Pane Name"));
    d->widgetStack = new QStackedWidget(this);
    d->widgetStack->setObjectName(QStringLiteral("Tool Pane Widget Stack"));
    layout->addWidget(d->nameLabel, 0);
    layout->addWidget(d->widgetStack, 2);
    layout->addItem(new QSpacerItem(0, 0, QSizePolicy::Minimum, QSizePolicy::Expanding));

    setMinimumSize(200, 150);
}

RkToolPane::~RkToolPane() = default;

void RkToolPane::toolSwitched()
{
    d->needsRebuild = true;
    refresh();
}

void RkToolPane::refresh()
{
    if (!d->needsRebuild)
        return;
    RkViewportMgr* mgr = viewportMgr();
    RkViewTool* tool = mgr ? mgr->getActiveTool() : nullptr;
    QWidget* optionsWidget = tool ? tool->getOptionsWidget(this) : nullptr;
    RkActionMenu* toolMenu = tool ? tool->getOptionsMenu() : nullptr;

    if (d->currentTool)
        disconnect(d->currentTool, &RkViewTool::rebuildMenu, this, &RkToolPane::rebuildMenu);
    if (tool)
        connect(tool, &RkViewTool::rebuildMenu, this, &RkToolPane::rebuildMenu);
    d->currentTool = tool;

    d->nameLabel->setText(tool ? tool->objectName() : QString());
    if (optionsWidget) {
        // Each tool's widget is added once and stays in the stack behind the others.
        int index = d->widgetStack->indexOf(optionsWidget);
        if (index < 0)
            index = d->widgetStack->addWidget(optionsWidget);
        d->widgetStack->setCurrentIndex(index);
        d->widgetStack->show();
    } else {
        d->widgetStack->hide();
    }
    setOptionsMenu(new RkToolActionMenu(this, toolMenu));
    d->needsRebuild = false;
}

void RkToolPane::rebuildMenu()
{
    RkViewportMgr* mgr = viewportMgr();
    RkViewTool* tool = mgr ? mgr->getActiveTool() : nullptr;
    setOptionsMenu(new RkToolActionMenu(this, tool ? tool->getOptionsMenu() : nullptr));
}
