#include "render/rkrenderdata.h"

#include <QPainter>

RkRenderData::RkRenderData(const QImage& pixels, int frame, const QPoint& offset)
    : m_pixels(pixels), m_frame(frame), m_offset(offset)
{
}

RkRenderData::~RkRenderData() = default;

bool RkRenderData::copyToImage(QImage& image, int x, int y) const
{
    if (m_pixels.isNull() || image.isNull())
        return false;
    // Indexed and monochrome images cannot be painted on.
    switch (image.format()) {
    case QImage::Format_Invalid:
    case QImage::Format_Mono:
    case QImage::Format_MonoLSB:
    case QImage::Format_Indexed8:
        return false;
    default:
        break;
    }
    const QRect target = QRect(QPoint(x, y), m_pixels.size()).intersected(image.rect());
    if (target.isEmpty())
        return false;
    QPainter painter(&image);
    painter.setCompositionMode(QPainter::CompositionMode_Source);
    painter.drawImage(QPoint(x, y), m_pixels);
    return painter.end();
}
