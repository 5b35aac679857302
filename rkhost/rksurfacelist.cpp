#include "rksurfacelist.h"

#include "app/rkmainwindow.h"
#include "scene/rkmaterial.h"
#include "scene/rknode.h"
#include "scene/rkobject.h"
#include "scene/rkscene.h"
#include "scene/rkshape.h"
#include "scene/rkskeleton.h"

#include <QDockWidget>
#include <QMouseEvent>

RkSurfaceList::RkSurfaceList(QWidget* parent)
    : RkSceneTreeList(parent, QStringLiteral("SurfaceList"))
{
    connect(rkScene, &RkScene::materialSelectionChanged, this, &RkSurfaceList::showSelection);
    rebuild();
}

RkSurfaceList::~RkSurfaceList() = default;

QTreeWidgetItem* RkSurfaceList::itemForMaterial(const RkMaterial* material) const
{
    for (auto it = m_materials.cbegin(); it != m_materials.cend(); ++it) {
        if (material && it.value() == material)
            return const_cast<QTreeWidgetItem*>(it.key());
    }
    return nullptr;
}

RkMaterial* RkSurfaceList::materialForItem(const QTreeWidgetItem* item) const
{
    return m_materials.value(item);
}

void RkSurfaceList::mousePressEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton) {
        QTreeWidget::mousePressEvent(event);
        return;
    }
    QTreeWidgetItem* item = itemAt(event->pos());
    RkMaterial* material = materialForItem(item);
    if (!material) {
        QTreeWidget::mousePressEvent(event);
        if (!item)
            RkMaterial::clearMaterialSelection();
        return;
    }
    if (event->modifiers() & Qt::ControlModifier) {
        material->setSelected(!material->isSelected());
    } else {
        for (RkMaterial* other : RkMaterial::getSelectedMaterials()) {
            if (other != material)
                other->setSelected(false);
        }
        material->setSelected(true);
    }
    event->accept();
}

void RkSurfaceList::rebuild()
{
    clear();
    m_materials.clear();
    // A figure's bones share the figure's materials: they are listed once, under the figure.
    QHash<const RkNode*, QTreeWidgetItem*> groups;
    for (RkNode* node : rkScene->getNodes()) {
        // A new object (and with it new materials) comes with uvsChanged().
        connect(node, &RkNode::uvsChanged, this, &RkSurfaceList::scheduleRebuild,
                Qt::UniqueConnection);
        RkObject* object = node->getObject();
        if (!object)
            continue;
        const RkNode* owner = node->getSkeleton() ? node->getSkeleton() : node;
        for (int s = 0; s < object->getNumShapes(); ++s) {
            RkShape* shape = object->getShape(s);
            for (int m = 0; shape && m < shape->getNumMaterials(); ++m) {
                RkMaterial* material = shape->getMaterial(m);
                if (!material || itemForMaterial(material))
                    continue;
                QTreeWidgetItem*& group = groups[owner];
                if (!group) {
                    group = new QTreeWidgetItem(this);
                    group->setText(0, owner->getLabel());
                    group->setExpanded(true);
                }
                auto* item = new QTreeWidgetItem(group);
                item->setText(0, material->getLabel());
                m_materials.insert(item, material);
            }
        }
    }
    showSelection();
}

void RkSurfaceList::showSelection()
{
    for (auto it = m_materials.cbegin(); it != m_materials.cend(); ++it) {
        auto* item = const_cast<QTreeWidgetItem*>(it.key());
        const bool on = it.value() && it.value()->isSelected();
        markSelected(item, on, palette());
    }
}

RkSurfaceList* rkAddSurfaceList(RkMainWindow* window)
{
    auto* dock = new QDockWidget(RkSurfaceList::tr("Surfaces"), window);
    dock->setObjectName(QStringLiteral("SurfacesDock"));
    auto* list = new RkSurfaceList(dock);
    dock->setWidget(list);
    // Beside the scene list, as a tab of the same dock area; the scene list stays in front.
    if (auto* scene = window->findChild<QDockWidget*>(QStringLiteral("SceneDock"))) {
        window->tabifyDockWidget(scene, dock);
        scene->raise();
    } else {
        window->addDockWidget(Qt::LeftDockWidgetArea, dock);
    }
    return list;
}
