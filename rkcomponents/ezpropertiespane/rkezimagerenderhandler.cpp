#include "rkezimagerenderhandler.h"

#include "render/rk3dviewport.h"
#include "render/rkrenderdata.h"
#include "rkezicongridwgt.h"
#include "rkezpropertiescontrol.h"
#include "rksourcewarning.h"
#include "undo/rkundostack.h"
#include "undo/rkundostackhold.h"
#include "widgets/rkfloatslider.h"

#include <QImage>
#include <QPointer>

struct RkEzImageRenderHandler::Private {
    QPointer<Rk3DViewport> viewport;
    QPointer<RkEzPropertiesControl> tile;
    // A tile whose hover preview was stopped for the render; it previews again afterwards.
    QPointer<RkEzPropertiesControl> interruptedTile;
    QImage image;
    // Gathers the framing (and, nested in it, the tile's preview) from renderStarting() on.
    std::unique_ptr<RkUndoStackHold> hold;
};

RkEzImageRenderHandler::RkEzImageRenderHandler(Rk3DViewport* viewport, RkEzPropertiesControl* tile,
                                               const QSize& size, int startTime)
    : RkImageRenderHandler(size, startTime, QString()), d(std::make_unique<Private>())
{
    d->viewport = viewport;
    d->tile = tile;
    d->image = QImage(size, QImage::Format_ARGB32);
    d->image.fill(0);
}

RkEzImageRenderHandler::~RkEzImageRenderHandler()
{
    if (!d->hold)
        return;
    // The tile's preview hold is nested in ours: close it first.
    if (d->tile)
        d->tile->endPreview();
    d->hold->cancel();
    d->hold.reset();
}

void RkEzImageRenderHandler::renderStarting()
{
    d->interruptedTile = nullptr;
    if (d->tile && d->tile->getGrid()) {
        for (RkEzPropertiesControl* other : d->tile->getGrid()->getTiles()) {
            if (other->isPreviewing()) {
                d->interruptedTile = other;
                other->endPreview();
                break;
            }
        }
    }
    if (rkUndoStack->canPushItems())
        RK_SOURCE_WARNING(QStringLiteral("### canPushItems"));
    d->hold = std::make_unique<RkUndoStackHold>();
    if (d->viewport)
        d->viewport->frameCamera();
}

void RkEzImageRenderHandler::renderStep() {}

void RkEzImageRenderHandler::frameStarting(int)
{
    if (d->tile)
        d->tile->beginPreview();
}

bool RkEzImageRenderHandler::takeFrameData(const RkRenderData* data)
{
    return data && data->copyToImage(d->image, 0, 0);
}

void RkEzImageRenderHandler::renderFinished()
{
    if (d->tile) {
        d->tile->endPreview();
        d->tile->setImage(d->image);
    }
    d->image = QImage();
    if (d->hold) {
        d->hold->cancel();
        d->hold.reset();
    }
    // The pointer still rests on that tile's thumbnail: its preview goes on.
    if (RkEzPropertiesControl* tile = d->interruptedTile) {
        tile->setPointerOverImage(true);
        tile->getSlider()->hide();
        tile->beginPreview();
    }
}
