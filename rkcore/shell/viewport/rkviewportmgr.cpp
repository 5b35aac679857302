#include "viewport/rkviewportmgr.h"

#include "viewport/rkviewport.h"
#include "viewport/rkviewtool.h"

#include <QAction>
#include <QActionGroup>
#include <QPointer>
#include <QToolBar>

struct RkViewportMgr::Private {
    QList<RkViewTool*> tools;
    QPointer<RkViewTool> activeTool;
    QList<QPointer<RkViewport>> viewports;
    QPointer<RkViewport> activeViewport;
    QPointer<QToolBar> toolBar;
    QActionGroup* group = nullptr;
};

RkViewportMgr::RkViewportMgr(QObject* parent) : QObject(parent), d(std::make_unique<Private>())
{
    d->group = new QActionGroup(this);
    d->group->setExclusive(true);
}

RkViewportMgr::~RkViewportMgr()
{
    // The tool bar may outlive the manager; its buttons must not reach the tools any more.
    delete d->group;
    d->group = nullptr;
}

void RkViewportMgr::addTool(RkViewTool* tool)
{
    if (!tool || d->tools.contains(tool))
        return;
    tool->setParent(this);
    d->tools.append(tool);
    auto* action = new QAction(tool->getIcon(), tool->objectName(), d->group);
    // A tool deleted by its owner takes its button along.
    connect(tool, &QObject::destroyed, this, [this, tool, action] {
        d->tools.removeAll(tool);
        delete action;
    });
    action->setObjectName(tool->objectName());
    action->setCheckable(true);
    action->setToolTip(tool->objectName());
    QPointer<RkViewTool> guarded(tool);
    connect(action, &QAction::triggered, this, [this, guarded] {
        if (guarded)
            setActiveTool(guarded);
    });
    if (d->toolBar) {
        d->toolBar->addAction(action);
        if (QWidget* button = d->toolBar->widgetForAction(action))
            button->setObjectName(tool->objectName());
    }
    if (!d->activeTool)
        setActiveTool(tool);
}

QList<RkViewTool*> RkViewportMgr::getTools() const
{
    return d->tools;
}

RkViewTool* RkViewportMgr::findTool(const QString& name) const
{
    for (RkViewTool* tool : d->tools) {
        if (tool->objectName() == name)
            return tool;
    }
    return nullptr;
}

RkViewTool* RkViewportMgr::getActiveTool() const
{
    return d->activeTool;
}

void RkViewportMgr::setActiveTool(RkViewTool* tool)
{
    if (!tool || tool == d->activeTool || !d->tools.contains(tool))
        return;
    d->activeTool = tool;
    for (QAction* action : d->group->actions()) {
        if (action->objectName() == tool->objectName())
            action->setChecked(true);
    }
    Q_EMIT activeToolSwitched();
}

void RkViewportMgr::addViewport(RkViewport* viewport)
{
    if (!viewport || d->viewports.contains(viewport))
        return;
    d->viewports.append(viewport);
    if (!d->activeViewport)
        setActiveViewport(viewport);
}

QList<RkViewport*> RkViewportMgr::getViewports() const
{
    QList<RkViewport*> result;
    for (const QPointer<RkViewport>& v : d->viewports) {
        if (v)
            result.append(v);
    }
    return result;
}

RkViewport* RkViewportMgr::getActiveViewport() const
{
    return d->activeViewport;
}

void RkViewportMgr::setActiveViewport(RkViewport* viewport)
{
    if (viewport == d->activeViewport)
        return;
    d->activeViewport = viewport;
    Q_EMIT activeViewportChanged();
}

QToolBar* RkViewportMgr::getToolBar()
{
    if (!d->toolBar) {
        d->toolBar = new QToolBar(tr("Viewport Tools"));
        d->toolBar->setObjectName(QStringLiteral("ViewportToolBar"));
        d->toolBar->setToolButtonStyle(Qt::ToolButtonTextBesideIcon);
        for (QAction* action : d->group->actions()) {
            d->toolBar->addAction(action);
            if (QWidget* button = d->toolBar->widgetForAction(action))
                button->setObjectName(action->objectName());
        }
    }
    return d->toolBar;
}
