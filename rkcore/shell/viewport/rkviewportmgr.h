#pragma once

#include "rkcoreglobal.h"

#include <QList>
#include <QObject>

#include <memory>

class QToolBar;
class RkViewTool;
class RkViewport;

// Knows the viewports and the viewport tools, which viewport is active and which tool. The tools
// appear as exclusive buttons on the tool bar it makes; picking one makes it the active tool.
// Owned by the main window.
class RKCORE_EXPORT RkViewportMgr : public QObject
{
    Q_OBJECT
public:
    explicit RkViewportMgr(QObject* parent = nullptr);
    ~RkViewportMgr() override;

    // The manager owns the tool. The first tool added becomes the active one.
    void addTool(RkViewTool* tool);
    QList<RkViewTool*> getTools() const;
    RkViewTool* findTool(const QString& name) const;
    RkViewTool* getActiveTool() const;
    // Emits activeToolSwitched() when the tool changes; the tool must have been added.
    void setActiveTool(RkViewTool* tool);

    // The viewport stays owned by its Qt parent. The first one added becomes the active one.
    void addViewport(RkViewport* viewport);
    QList<RkViewport*> getViewports() const;
    RkViewport* getActiveViewport() const;
    void setActiveViewport(RkViewport* viewport);

    // The tool bar with one checkable button per tool (object name of the button and its action:
    // the tool's name). Made on first call; the caller gives it a parent.
    QToolBar* getToolBar();

Q_SIGNALS:
    void activeToolSwitched();
    void activeViewportChanged();

private:
    struct Private;
    std::unique_ptr<Private> d;
};
