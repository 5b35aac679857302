#include "rkuvview.h"

#include "geometry/rkgeometry.h"
#include "rkuvexporter.h"
#include "rkuvwgt.h"
#include "scene/rkbone.h"
#include "scene/rkmaterial.h"
#include "scene/rkobject.h"
#include "scene/rkscene.h"
#include "scene/rkshape.h"
#include "scene/rkskeleton.h"
#include "viewport/rkviewtoolbar.h"
#include "widgets/rkmenubutton.h"

#include <QApplication>
#include <QCoreApplication>
#include <QFileDialog>
#include <QInputDialog>
#include <QMessageBox>
#include <QPointer>
#include <QStyle>
#include <QVBoxLayout>

struct RkUVView::Private {
    RkUVWgt* wgt = nullptr;
    RkMenuButton* modeButton = nullptr;
    // A refresh event is on its way; kept apart from the block so that a load that starts while
    // an event is queued still ends in one refresh.
    bool eventQueued = false;
    bool blocked = false;
    // A refresh was asked for while the view was hidden; it is made up for when it shows.
    bool refreshDropped = false;
    int viewMode = 2;
    // Guarded: a material can go away without its node being removed.
    QList<QPointer<RkNode>> nodeListeners;
    QList<QPointer<RkMaterial>> materialListeners;
};

RkUVView::RkUVView() : RkView(QStringLiteral("RkUVView")), d(std::make_unique<Private>())
{
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);
    layout->addWidget(getToolBar(), 0);
    buildToolBar();
    d->wgt = new RkUVWgt(this);
    layout->addWidget(d->wgt, 100);

    connect(rkScene, &RkScene::sceneLoadStarting, this, &RkUVView::blockRefreshEvents);
    connect(rkScene, &RkScene::sceneLoaded, this, &RkUVView::unblockRefreshEvents);
    connect(rkScene, &RkScene::sceneClearStarting, this, &RkUVView::clearListeners);
    connect(rkScene, &RkScene::nodeRemoved, this, &RkUVView::nodeRemoved);
    refreshUVList();
}

RkUVView::~RkUVView() = default;

QString RkUVView::getLabel() const
{
    return QStringLiteral("UV View");
}

QIcon RkUVView::getIcon() const
{
    return QApplication::style()->standardPixmap(
        QStyle::StandardPixmap(QStyle::SP_CustomBase + 21));
}

void RkUVView::buildToolBar()
{
    const int height = style()->pixelMetric(QStyle::PixelMetric(QStyle::PM_CustomBase + 42));
    const int extra = style()->pixelMetric(QStyle::PixelMetric(QStyle::PM_CustomBase + 62));
    d->modeButton = new RkMenuButton(this, objectName(), QString());
    d->modeButton->setButtonStyle(RkStyledButton::ButtonStyle(3));
    d->modeButton->setFixedSize(110 + extra, height);
    d->modeButton->insertItem(QStringLiteral("View by Material"), -1, -1);
    d->modeButton->insertItem(QStringLiteral("View by Node"), -1, -1);
    connect(d->modeButton, &RkMenuButton::menuIndexSelected, this, &RkUVView::changeViewMode);
    d->modeButton->selectItemAt(0);
    getToolBar()->addWidget(d->modeButton, 0);

    auto* frame = new RkStyledButton(this, QStringLiteral("UVFrameButton"), tr("Frame"));
    frame->setButtonStyle(RkStyledButton::ToolStyle);
    frame->setFixedHeight(height);
    connect(frame, &QAbstractButton::clicked, this, [this] {
        if (d->wgt)
            d->wgt->frame();
    });
    getToolBar()->addWidget(frame, RkViewToolBar::Right);

    auto* exporter =
        new RkStyledButton(this, QStringLiteral("UVExportButton"), tr("Export UV Layout..."));
    exporter->setButtonStyle(RkStyledButton::ToolStyle);
    exporter->setFixedHeight(height);
    connect(exporter, &QAbstractButton::clicked, this, &RkUVView::exportLayoutInteractive);
    getToolBar()->addWidget(exporter, RkViewToolBar::Right);
}

RkUVWgt* RkUVView::getUVWgt() const
{
    return d->wgt;
}

RkMenuButton* RkUVView::getModeButton() const
{
    return d->modeButton;
}

int RkUVView::getViewMode() const
{
    return d->viewMode;
}

bool RkUVView::isRefreshPending() const
{
    return d->eventQueued || d->blocked;
}

void RkUVView::postRefreshEvent()
{
    if (d->blocked || d->eventQueued)
        return;
    if (!isVisible()) {
        d->refreshDropped = true;
        return;
    }
    d->eventQueued = true;
    QCoreApplication::postEvent(this, new QEvent(QEvent::Type(RefreshEvent)));
}

void RkUVView::changeViewMode(int newMode)
{
    if ((newMode != 0 && newMode != 1) || newMode == d->viewMode)
        return;
    d->viewMode = newMode;
    disconnect(rkScene, &RkScene::materialSelectionChanged, this, &RkUVView::postRefreshEvent);
    disconnect(rkScene, &RkScene::nodeSelectionListChanged, this, &RkUVView::postRefreshEvent);
    if (newMode == 0)
        connect(rkScene, &RkScene::materialSelectionChanged, this, &RkUVView::postRefreshEvent);
    else
        connect(rkScene, &RkScene::nodeSelectionListChanged, this, &RkUVView::postRefreshEvent);
    postRefreshEvent();
}

void RkUVView::refreshUVList()
{
    if (d->viewMode == 1) {
        for (const QPointer<RkNode>& node : qAsConst(d->nodeListeners)) {
            if (node)
                disconnect(node, &RkNode::uvsChanged, this, &RkUVView::postRefreshEvent);
        }
        d->nodeListeners.clear();
        RkNodeList nodes;
        auto take = [&](RkNode* node) {
            if (nodes.contains(node))
                return;
            nodes.append(node);
            connect(node, &RkNode::uvsChanged, this, &RkUVView::postRefreshEvent);
        };
        RkNodeListIterator it = rkScene->selectedNodeListIterator();
        while (it.hasNext()) {
            RkNode* node = it.next();
            if (auto* skeleton = qobject_cast<RkSkeleton*>(node)) {
                QList<RkBone*> bones;
                skeleton->getAllBones(bones);
                for (RkBone* bone : qAsConst(bones))
                    take(bone);
            } else {
                take(node);
            }
        }
        for (RkNode* node : qAsConst(nodes))
            d->nodeListeners.append(node);
        if (d->wgt)
            d->wgt->setUVList(nodes);
    } else if (d->viewMode == 0) {
        for (const QPointer<RkMaterial>& material : qAsConst(d->materialListeners)) {
            if (material)
                disconnect(material, &RkMaterial::uvsChanged, this, &RkUVView::postRefreshEvent);
        }
        d->materialListeners.clear();
        QList<RkMaterial*> materials;
        for (int i = 0; i < RkMaterial::getNumMaterials(); ++i) {
            RkMaterial* material = RkMaterial::getMaterial(i);
            if (material && material->isSelected()) {
                materials.append(material);
                connect(material, &RkMaterial::uvsChanged, this, &RkUVView::postRefreshEvent);
                d->materialListeners.append(material);
            }
        }
        if (d->wgt)
            d->wgt->setUVList(materials);
    }
}

void RkUVView::blockRefreshEvents()
{
    d->blocked = true;
}

void RkUVView::unblockRefreshEvents()
{
    d->blocked = false;
    postRefreshEvent();
}

void RkUVView::nodeRemoved(RkNode* node)
{
    d->nodeListeners.removeAll(node);
    RkObject* object = node ? node->getObject() : nullptr;
    if (!object)
        return;
    for (int s = 0; s < object->getNumShapes(); ++s) {
        RkShape* shape = object->getShape(s);
        for (int m = 0; shape && m < shape->getNumMaterials(); ++m)
            d->materialListeners.removeAll(shape->getMaterial(m));
    }
}

void RkUVView::clearListeners()
{
    d->nodeListeners.clear();
    d->materialListeners.clear();
}

void RkUVView::customEvent(QEvent* event)
{
    if (event->type() != QEvent::Type(RefreshEvent))
        return;
    d->eventQueued = false;
    // An event that arrives while the scene loads waits for the one the end of the load posts.
    if (!d->blocked)
        refreshUVList();
}

void RkUVView::showEvent(QShowEvent* event)
{
    RkView::showEvent(event);
    if (d->refreshDropped) {
        d->refreshDropped = false;
        postRefreshEvent();
    }
}

bool RkUVView::exportLayout(const QString& path, int size, QString* error) const
{
    return RkUVExporter::write(d->wgt->getUVSets(), size, path, error);
}

void RkUVView::exportLayoutInteractive()
{
    bool ok = false;
    const int size = QInputDialog::getInt(this, tr("Export UV Layout"), tr("Size in pixels:"),
                                          RkUVExporter::DefaultSize, RkUVExporter::MinSize,
                                          RkUVExporter::MaxSize, 256, &ok);
    if (!ok)
        return;
    const QString path = QFileDialog::getSaveFileName(
        this, tr("Export UV Layout"), QStringLiteral("uv-layout.png"), tr("PNG images (*.png)"));
    if (path.isEmpty())
        return;
    QString error;
    if (!exportLayout(path, size, &error))
        QMessageBox::warning(this, tr("Export UV Layout"), error);
}
