#include "rkscenelist.h"

#include "app/rkmainwindow.h"
#include "scene/rknode.h"
#include "scene/rkscene.h"

#include <QDockWidget>
#include <QHash>
#include <QMouseEvent>
#include <QPointer>

RkSceneList::RkSceneList(QWidget* parent) : RkSceneTreeList(parent, QStringLiteral("SceneList"))
{
    connect(rkScene, &RkScene::nodeSelectionListChanged, this, &RkSceneList::showSelection);
    rebuild();
}

RkSceneList::~RkSceneList() = default;

QTreeWidgetItem* RkSceneList::itemForNode(const RkNode* node) const
{
    for (QTreeWidgetItemIterator it(const_cast<RkSceneList*>(this)); *it; ++it) {
        if (nodeForItem(*it) == node)
            return *it;
    }
    return nullptr;
}

RkNode* RkSceneList::nodeForItem(const QTreeWidgetItem* item) const
{
    // Guarded: a node may go before the list hears of it.
    RkNode* node = m_nodes.value(item);
    return node && rkScene->contains(node) ? node : nullptr;
}

void RkSceneList::mousePressEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton) {
        QTreeWidget::mousePressEvent(event);
        return;
    }
    QTreeWidgetItem* item = itemAt(event->pos());
    RkNode* node = nodeForItem(item);
    // Presses on the expand arrow only fold the item.
    const bool onArrow = item && event->pos().x() < visualItemRect(item).left();
    if (!node || onArrow) {
        QTreeWidget::mousePressEvent(event);
        if (!item)
            rkScene->clearSelection();
        return;
    }
    const bool add = event->modifiers() & Qt::ControlModifier;
    if (add && node->isSelected())
        rkScene->deselectNode(node);
    else
        rkScene->selectNode(node, add);
    event->accept();
}

void RkSceneList::rebuild()
{
    clear();
    m_nodes.clear();
    QHash<const RkNode*, QTreeWidgetItem*> items;
    const RkNodeList nodes = rkScene->getNodes();
    // Parents come first however the scene lists them.
    std::function<QTreeWidgetItem*(RkNode*)> itemFor = [&](RkNode* node) -> QTreeWidgetItem* {
        if (QTreeWidgetItem* done = items.value(node))
            return done;
        RkNode* parent = node->getNodeParent();
        QTreeWidgetItem* item = parent && rkScene->contains(parent)
                                    ? new QTreeWidgetItem(itemFor(parent))
                                    : new QTreeWidgetItem(this);
        item->setText(0, node->getLabel());
        m_nodes.insert(item, node);
        items.insert(node, item);
        connect(node, &RkElement::labelChanged, this, &RkSceneList::scheduleRebuild,
                Qt::UniqueConnection);
        return item;
    };
    for (RkNode* node : nodes)
        itemFor(node);
    // Top-level nodes show what lies directly below them.
    for (int i = 0; i < topLevelItemCount(); ++i)
        topLevelItem(i)->setExpanded(true);
    showSelection();
}

void RkSceneList::showSelection()
{
    for (QTreeWidgetItemIterator it(this); *it; ++it) {
        RkNode* node = nodeForItem(*it);
        const bool on = node && node->isSelected();
        markSelected(*it, on, palette());
        QFont font = (*it)->font(0);
        font.setBold(node && node == rkScene->getPrimarySelection());
        (*it)->setFont(0, font);
    }
    if (QTreeWidgetItem* primary = itemForNode(rkScene->getPrimarySelection()))
        scrollToItem(primary);
}

RkSceneList* rkAddSceneList(RkMainWindow* window)
{
    auto* dock = new QDockWidget(RkSceneList::tr("Scene"), window);
    dock->setObjectName(QStringLiteral("SceneDock"));
    auto* list = new RkSceneList(dock);
    dock->setWidget(list);
    window->addDockWidget(Qt::LeftDockWidgetArea, dock);
    return list;
}
