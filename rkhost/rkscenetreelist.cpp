#include "rkscenetreelist.h"

#include "scene/rkscene.h"

#include <QTimer>

RkSceneTreeList::RkSceneTreeList(QWidget* parent, const QString& name) : QTreeWidget(parent)
{
    setObjectName(name);
    setHeaderHidden(true);
    setColumnCount(1);
    setSelectionMode(QAbstractItemView::NoSelection);
    setFocusPolicy(Qt::NoFocus);

    connect(rkScene, &RkScene::nodeAdded, this, &RkSceneTreeList::scheduleRebuild);
    connect(rkScene, &RkScene::nodeRemoved, this, &RkSceneTreeList::scheduleRebuild);
    // While a scene loads or clears, one rebuild at the end is enough.
    connect(rkScene, &RkScene::sceneLoadStarting, this, [this] { m_blocked = true; });
    connect(rkScene, &RkScene::sceneClearStarting, this, [this] { m_blocked = true; });
    connect(rkScene, &RkScene::sceneLoaded, this, [this] {
        m_blocked = false;
        rebuild();
    });
    connect(rkScene, &RkScene::sceneCleared, this, [this] {
        m_blocked = false;
        rebuild();
    });
}

RkSceneTreeList::~RkSceneTreeList() = default;

void RkSceneTreeList::scheduleRebuild()
{
    if (m_blocked || m_rebuildPending)
        return;
    m_rebuildPending = true;
    QTimer::singleShot(0, this, [this] {
        m_rebuildPending = false;
        if (!m_blocked)
            rebuild();
    });
}

void RkSceneTreeList::markSelected(QTreeWidgetItem* item, bool on, const QPalette& palette)
{
    item->setBackground(0, on ? QBrush(palette.color(QPalette::Highlight)) : QBrush());
    item->setForeground(0, on ? QBrush(palette.color(QPalette::HighlightedText)) : QBrush());
}
