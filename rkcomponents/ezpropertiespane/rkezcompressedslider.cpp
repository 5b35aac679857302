#include "rkezcompressedslider.h"

#include <QStyle>

RkEzCompressedSlider::RkEzCompressedSlider(QWidget* parent, const QString& text)
    : RkFloatSlider(parent, text)
{
}

RkEzCompressedSlider::~RkEzCompressedSlider() = default;

void RkEzCompressedSlider::setLabel(const QString& label)
{
    RkFloatSlider::setLabel(label);
    updateRect();
}

int RkEzCompressedSlider::valueWidth()
{
    return textWidth(QStringLiteral("000.0%"));
}

QSize RkEzCompressedSlider::calcMinSize()
{
    const int h = style()->pixelMetric(QStyle::PixelMetric(QStyle::PM_CustomBase + 9));
    const int t = style()->pixelMetric(QStyle::PM_SliderThickness);
    return QSize(3 * h, qMax(t, h));
}

QRect RkEzCompressedSlider::calcSliderRect()
{
    const QRect r = rect();
    const int m = style()->pixelMetric(QStyle::PM_CustomBase);
    const int t = style()->pixelMetric(QStyle::PM_SliderThickness);
    int left = r.left();
    int width = r.width();
    if (showingLabel()) {
        const int labelSpace = textWidth(getLabel()) + m;
        left += labelSpace;
        width -= labelSpace;
    }
    if (isTextVisible())
        width -= valueWidth() + m;
    return QRect(left, r.top(), width, t);
}

QRect RkEzCompressedSlider::calcTextRect()
{
    const QRect r = rect();
    const int h = style()->pixelMetric(QStyle::PixelMetric(QStyle::PM_CustomBase + 9));
    const int vw = valueWidth();
    // Ends one pixel short of the right edge.
    return QRect(r.right() - vw, r.top(), vw, h);
}

QRect RkEzCompressedSlider::calcEditRect()
{
    return calcTextRect();
}

QRect RkEzCompressedSlider::calcLabelRect()
{
    const QRect r = rect();
    const int h = style()->pixelMetric(QStyle::PixelMetric(QStyle::PM_CustomBase + 9));
    return QRect(r.left(), r.top(), textWidth(getLabel()), h);
}
