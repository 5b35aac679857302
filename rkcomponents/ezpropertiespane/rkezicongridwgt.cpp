#include "rkezicongridwgt.h"

#include "app/rkapp.h"
#include "app/rkmainwindow.h"
#include "cdropbutton.h"
#include "properties/rkfloatproperty.h"
#include "render/rk3dviewport.h"
#include "rkezimagerenderhandler.h"
#include "rkezpropertiescontrol.h"
#include "rkezpropertiesdragger.h"
#include "rkezpropertiespage.h"
#include "rksourcewarning.h"
#include "scene/rkscene.h"
#include "undo/rkundostack.h"
#include "viewport/rkviewport.h"
#include "viewport/rkviewportmgr.h"

#include <QGridLayout>
#include <QPointer>
#include <QSpacerItem>
#include <QTimer>
#include <QVBoxLayout>

#include <algorithm>

namespace
{

// While another edit holds the undo stack the making waits; it looks again this often instead of
// spinning at interval 0.
const int kHeldStackRetryMs = 100;

} // namespace

struct RkEzIconGridWgt::Private {
    RkEzPropertiesPage* page = nullptr;
    QGridLayout* grid = nullptr;
    // Tiles are deleted later by clear(); the guards also skip tiles deleted by anyone else.
    QVector<QPointer<RkEzPropertiesControl>> tiles;
    QList<QSpacerItem*> spacers;
    QPointer<RkEzPropertiesDragger> dragger;
    QTimer* timer = nullptr;
    // Index in tiles of the next thumbnail; -1 when no making is wanted.
    int nextImage = -1;
    int first = 0;

    bool making() const { return nextImage >= 0 && nextImage < tiles.count(); }
};

RkEzIconGridWgt::RkEzIconGridWgt(QWidget* parent, RkEzPropertiesPage* page)
    : QWidget(parent), d(std::make_unique<Private>())
{
    d->page = page;
    setObjectName(QStringLiteral("ShapePropertiesIconGridWgt"));
    d->timer = new QTimer(this);

    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    d->grid = new QGridLayout;
    d->grid->setContentsMargins(0, 0, 0, 0);
    for (int i = 0; i < 3; ++i) {
        d->grid->setColumnStretch(i, 100);
        d->grid->setRowStretch(i, 100);
    }
    layout->addLayout(d->grid, 0);
    layout->addWidget(new CDropButton(this, page ? page->getOwner() : nullptr), 0, Qt::AlignBottom);

    d->timer->setInterval(0);
    connect(d->timer, &QTimer::timeout, this, &RkEzIconGridWgt::makeImageTimeout);
}

RkEzIconGridWgt::~RkEzIconGridWgt()
{
    d->timer->stop();
    // A drag still running ends over the tiles, which go after this.
    delete d->dragger;
}

RkEzPropertiesPage* RkEzIconGridWgt::getPage() const
{
    return d->page;
}

QVector<RkEzPropertiesControl*> RkEzIconGridWgt::getTiles() const
{
    QVector<RkEzPropertiesControl*> tiles;
    tiles.reserve(d->tiles.size());
    for (const auto& tile : d->tiles) {
        if (tile)
            tiles.append(tile);
    }
    return tiles;
}

RkEzPropertiesDragger* RkEzIconGridWgt::getDragger() const
{
    return d->dragger;
}

QTimer* RkEzIconGridWgt::getTimer() const
{
    return d->timer;
}

void RkEzIconGridWgt::setFirst(int first)
{
    d->first = std::max(0, first);
}

int RkEzIconGridWgt::getFirst() const
{
    return d->page ? d->page->getFirst() : d->first;
}

void RkEzIconGridWgt::snapshotTileValues()
{
    for (RkEzPropertiesControl* tile : getTiles())
        tile->takeValueSnapshot();
}

void RkEzIconGridWgt::mixTilesAt(int x, int y)
{
    for (RkEzPropertiesControl* tile : getTiles())
        tile->mixAt(x, y);
}

bool RkEzIconGridWgt::tileValuesChanged() const
{
    const QVector<RkEzPropertiesControl*> tiles = getTiles();
    return std::any_of(tiles.cbegin(), tiles.cend(), [](const RkEzPropertiesControl* tile) {
        return tile->differsFromSnapshot();
    });
}

QRect RkEzIconGridWgt::draggerBounds() const
{
    QRect area = d->grid->contentsRect();
    if (d->dragger) {
        area.setRight(area.right() - d->dragger->width());
        area.setBottom(area.bottom() - d->dragger->height());
    }
    for (const RkEzPropertiesControl* tile : getTiles()) {
        const QPoint corner = tile->pos();
        area.setLeft(std::min(area.left(), corner.x()));
        area.setTop(std::min(area.top(), corner.y()));
        area.setRight(std::max(area.right(), corner.x()));
        area.setBottom(std::max(area.bottom(), corner.y()));
    }
    return area;
}

QSize RkEzIconGridWgt::sizeHint() const
{
    return minimumSizeHint();
}

QSize RkEzIconGridWgt::minimumSizeHint() const
{
    const int s = d->grid->spacing();
    return QSize(195 + 2 * s, 240 + 2 * s);
}

void RkEzIconGridWgt::clear()
{
    if (d->dragger) {
        // A drag still running keeps what it mixed, as one entry, before its tiles go.
        d->dragger->endDrag();
        d->dragger->hide();
        d->dragger->deleteLater();
        d->dragger = nullptr;
    }
    // A tile may be clearing the grid from one of its own events.
    for (int i = d->tiles.size() - 1; i >= 0; --i) {
        if (RkEzPropertiesControl* tile = d->tiles[i]) {
            d->grid->removeWidget(tile);
            tile->hide();
            tile->deleteLater();
        }
    }
    d->tiles.clear();
    for (QSpacerItem* spacer : qAsConst(d->spacers)) {
        d->grid->removeItem(spacer);
        delete spacer;
    }
    d->spacers.clear();
}

void RkEzIconGridWgt::addProperties(QVector<RkProperty*> properties)
{
    if (properties.isEmpty())
        return;
    if (d->dragger || !d->tiles.isEmpty() || !d->spacers.isEmpty())
        clear();
    // A page's grid shows the page's current eight; a grid on its own keeps its own index.
    int idx = d->page ? d->page->getFirst() : d->first;
    for (int cell = 0; cell < 9; ++cell) {
        if (cell == 4)
            continue;
        const int row = cell / 3;
        const int column = cell % 3;
        RkFloatProperty* morph = nullptr;
        while (!morph && idx < properties.count())
            morph = qobject_cast<RkFloatProperty*>(properties[idx++]);
        if (morph) {
            auto* tile = new RkEzPropertiesControl(morph, this, this);
            d->grid->addWidget(tile, row, column);
            tile->show();
            d->tiles.append(tile);
        } else {
            auto* spacer = new QSpacerItem(0, 0, QSizePolicy::Minimum, QSizePolicy::Minimum);
            d->grid->addItem(spacer, row, column, 1, 1);
            d->spacers.append(spacer);
        }
    }

    // The handle is a child of the grid but no item of its layout: it lies over the centre cell.
    d->dragger = new RkEzPropertiesDragger(this, this);
    if (isVisible())
        layout()->activate();
    placeDragger();
    d->dragger->show();
    d->dragger->setHandleVisible(true);
}

void RkEzIconGridWgt::scheduleMakeImages()
{
    d->timer->stop();
    d->nextImage = 0;
    d->timer->setInterval(0);
    // A hidden grid starts making when it is shown.
    if (isVisible())
        d->timer->start();
}

void RkEzIconGridWgt::cancelMakeImages()
{
    d->timer->stop();
    d->nextImage = -1;
}

void RkEzIconGridWgt::makeImageTimeout()
{
    if (!d->making()) {
        d->timer->stop();
        return;
    }
    if (!isVisible()) {
        d->timer->stop();
        return;
    }
    const QVector<RkEzPropertiesControl*> tiles = getTiles();
    const bool previewing =
        std::any_of(tiles.cbegin(), tiles.cend(),
                    [](const RkEzPropertiesControl* t) { return t->isPreviewing(); });
    // Another edit holds the undo stack; a tile's own hover preview does not count.
    if (rkUndoStack->canPushItems() && !previewing) {
        d->timer->setInterval(kHeldStackRetryMs);
        return;
    }
    d->timer->setInterval(0);

    // A tile whose morph was removed while shown gets no thumbnail.
    RkEzPropertiesControl* tile = nullptr;
    while (!tile && d->nextImage < d->tiles.count()) {
        RkEzPropertiesControl* candidate = d->tiles[d->nextImage++];
        if (candidate && candidate->getProperty())
            tile = candidate;
    }
    if (!tile) {
        d->timer->stop();
        return;
    }

    RkMainWindow* mw = rkApp->getInterface();
    if (!mw) {
        RK_SOURCE_WARNING(QStringLiteral("Interface unavailable in "
                                         "RkEzPropertiesPage::makeImageTimeout(), cannot generate "
                                         "image."));
        return;
    }
    RkViewport* active = mw->getViewportMgr()->getActiveViewport();
    Rk3DViewport* viewport = active ? active->get3DViewport() : nullptr;
    if (!viewport) {
        // No other tile would fare better: one warning, and the making stops until scheduled again.
        RK_SOURCE_WARNING(QStringLiteral("No active 3D viewport, cannot generate images."));
        cancelMakeImages();
        return;
    }
    if (!viewport->canHardwareRender()) {
        RK_SOURCE_WARNING(
            QStringLiteral("Active viewport is not hardware renderable, cannot generate image."));
        return;
    }

    RkEzImageRenderHandler handler(viewport, tile, tile->getImageSize(), int(rkScene->getTime()));
    handler.setBackColor(viewport->getBackground());
    viewport->hardwareRender(&handler);
}

void RkEzIconGridWgt::showEvent(QShowEvent* event)
{
    QWidget::showEvent(event);
    placeDragger();
    if (d->making())
        d->timer->start();
}

void RkEzIconGridWgt::hideEvent(QHideEvent* event)
{
    QWidget::hideEvent(event);
    // Paused, not cancelled: showing the grid again goes on where it stopped.
    d->timer->stop();
}

void RkEzIconGridWgt::resizeEvent(QResizeEvent* event)
{
    QWidget::resizeEvent(event);
    placeDragger();
}

void RkEzIconGridWgt::placeDragger()
{
    if (d->dragger)
        d->dragger->setGeometry(d->grid->cellRect(1, 1));
}
