#include "render/rkimagerenderhandler.h"

#include "render/rkrenderdata.h"

struct RkImageRenderHandler::Private {
    QString fileName;
    QImage image;
    bool saved = true;
};

RkImageRenderHandler::RkImageRenderHandler(const QSize& size, int startTime,
                                           const QString& fileName, QObject* parent)
    : RkRenderHandler(size, startTime, parent), d(std::make_unique<Private>())
{
    d->fileName = fileName;
}

RkImageRenderHandler::~RkImageRenderHandler() = default;

QString RkImageRenderHandler::getFileName() const
{
    return d->fileName;
}

QImage RkImageRenderHandler::getImage() const
{
    return d->image;
}

bool RkImageRenderHandler::wasSaved() const
{
    return d->saved;
}

void RkImageRenderHandler::renderStarting()
{
    const QSize size = getSize();
    d->image = QImage();
    if (size.isValid() && !size.isEmpty()) {
        d->image = QImage(size, QImage::Format_ARGB32);
        d->image.fill(0);
    }
    d->saved = d->fileName.isEmpty();
}

bool RkImageRenderHandler::takeFrameData(const RkRenderData* data)
{
    if (!data || d->image.isNull())
        return false;
    return data->copyToImage(d->image, data->getOffset().x(), data->getOffset().y());
}

void RkImageRenderHandler::renderFinished()
{
    if (!d->fileName.isEmpty() && !d->image.isNull())
        d->saved = d->image.save(d->fileName);
}
