#include "render/rkrenderhandler.h"

#include <algorithm>

struct RkRenderHandler::Private {
    QSize size;
    int startTime = 0;
    QColor backColor = QColor(0, 0, 0, 0);
    QRect cropWindow;
    int numFrames = 1;
};

RkRenderHandler::RkRenderHandler(const QSize& size, int startTime, QObject* parent)
    : QObject(parent), d(std::make_unique<Private>())
{
    d->size = size;
    d->startTime = startTime;
}

RkRenderHandler::~RkRenderHandler() = default;

QSize RkRenderHandler::getSize() const
{
    return d->size;
}

void RkRenderHandler::setSize(const QSize& size)
{
    d->size = size;
}

int RkRenderHandler::getStartTime() const
{
    return d->startTime;
}

QColor RkRenderHandler::getBackColor() const
{
    return d->backColor;
}

void RkRenderHandler::setBackColor(const QColor& colour)
{
    d->backColor = colour;
}

QRect RkRenderHandler::getCropWindow() const
{
    return d->cropWindow;
}

int RkRenderHandler::getNumFrames() const
{
    return d->numFrames;
}

void RkRenderHandler::setNumFrames(int frames)
{
    d->numFrames = std::max(1, frames);
}

void RkRenderHandler::setCropWindow(const QRect& window)
{
    d->cropWindow = window.normalized();
}

void RkRenderHandler::renderStarting() {}

void RkRenderHandler::renderStep() {}

void RkRenderHandler::frameStarting(int) {}

void RkRenderHandler::renderFinished() {}

bool RkRenderHandler::takeFrameData(const RkRenderData*)
{
    return false;
}
