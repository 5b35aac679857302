#pragma once

#include "rkscenetreelist.h"
#include <QHash>
#include <QPointer>

class RkMainWindow;
class RkNode;

// The scene's nodes as a tree (figures with their bones). Clicking a node selects it, Ctrl+click
// adds it to the selection; the highlighted items follow the scene's selection however it
// changes.
class RkSceneList : public RkSceneTreeList
{
    Q_OBJECT
public:
    explicit RkSceneList(QWidget* parent = nullptr);
    ~RkSceneList() override;

    QTreeWidgetItem* itemForNode(const RkNode* node) const;
    RkNode* nodeForItem(const QTreeWidgetItem* item) const;

protected:
    void mousePressEvent(QMouseEvent* event) override;

private:
    void rebuild() override;
    void showSelection();

    QHash<const QTreeWidgetItem*, QPointer<RkNode>> m_nodes;
    bool m_showingSelection = false;
};

// Docks a scene list on the left of the main window.
RkSceneList* rkAddSceneList(RkMainWindow* window);
