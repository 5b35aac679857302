#pragma once

#include "rkcoreglobal.h"

#include <QImage>
#include <QPoint>

// One rendered frame as handed to a render handler: the pixels and where they lie in the full
// render (a cropped render starts at the crop window's top-left).
class RKCORE_EXPORT RkRenderData
{
public:
    RkRenderData(const QImage& pixels, int frame, const QPoint& offset = QPoint());
    ~RkRenderData();

    const QImage& getImage() const { return m_pixels; }
    int getFrame() const { return m_frame; }
    QPoint getOffset() const { return m_offset; }
    int width() const { return m_pixels.width(); }
    int height() const { return m_pixels.height(); }

    // Copies the rendered pixels into image with their top-left at (x, y), replacing what was
    // there (alpha included) and clipping at the image's edges. False when there is nothing to
    // copy, the image is null or of a format that cannot be drawn on, or no pixel lands inside it.
    bool copyToImage(QImage& image, int x, int y) const;

private:
    QImage m_pixels;
    int m_frame = 0;
    QPoint m_offset;
};
