#pragma once

#include "rkscenetreelist.h"
#include <QHash>
#include <QPointer>

class RkMainWindow;
class RkMaterial;

// The scene's materials ("surfaces"), listed under the node that shows them (a figure's bones
// count as the figure). Clicking a material selects it alone, Ctrl+click adds it or takes it out
// of the selection, a click on empty space clears the material selection; the highlighted items
// follow the material selection however it changes.
class RkSurfaceList : public RkSceneTreeList
{
    Q_OBJECT
public:
    explicit RkSurfaceList(QWidget* parent = nullptr);
    ~RkSurfaceList() override;

    QTreeWidgetItem* itemForMaterial(const RkMaterial* material) const;
    RkMaterial* materialForItem(const QTreeWidgetItem* item) const;

protected:
    void mousePressEvent(QMouseEvent* event) override;

private:
    void rebuild() override;
    void showSelection();

    QHash<const QTreeWidgetItem*, QPointer<RkMaterial>> m_materials;
};

// Docks a surface list on the left of the main window, below the scene list.
RkSurfaceList* rkAddSurfaceList(RkMainWindow* window);
