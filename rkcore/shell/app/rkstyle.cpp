#include "app/rkstyle.h"

#include <QApplication>
#include <QPainter>
#include <QPainterPath>
#include <QStyleFactory>
#include <QWidget>

namespace
{

// Custom pixel metrics, as offsets from QStyle::PM_CustomBase. Sizes are in device-independent
// pixels and suit the default 9-10 pt UI font.
struct MetricEntry {
    int offset;
    int value;
    const char* use;
};
constexpr MetricEntry metricTable[] = {
    {RkStyle::MetricSpacing, 4, "margin and spacing unit of every pane"},
    {RkStyle::MetricSliderHeight, 18, "height of a compressed slider in a property row"},
    {RkStyle::MetricRowHeight, 22, "height of a combo box, list header or caption row"},
    {RkStyle::MetricDividerHeight, 8, "thickness of a divider bar between two lists"},
    {RkStyle::MetricViewToolBarHeight, 22, "height of the buttons in a view's tool bar"},
    {RkStyle::MetricMenuButtonExtraWidth, 16, "extra width of a menu button for its arrow"},
    {RkStyle::MetricListFrameWidth, 1, "frame line width of a property list (0: no frame)"},
};

// Custom standard pixmaps, as offsets from QStyle::SP_CustomBase. All are drawn here, so the
// host needs no image files:
//   21  UV view       a unit square with a triangle of UV edges in it
//   48  previous      a left-pointing triangle
//   49  next          a right-pointing triangle
//   124 refresh       a circular arrow
//   125 list view     three bullets with lines
//   126 image view    a two-by-two grid of tiles

QPixmap drawCustomPixmap(int offset, int size, const QPalette& palette)
{
    QPixmap pixmap(size, size);
    pixmap.fill(Qt::transparent);
    QPainter p(&pixmap);
    p.setRenderHint(QPainter::Antialiasing);
    p.scale(size / 16.0, size / 16.0);
    const QColor ink = palette.color(QPalette::Active, QPalette::WindowText);
    p.setPen(QPen(ink, 1.4, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    switch (offset) {
    case RkStyle::PixmapPrevious:
    case RkStyle::PixmapNext: {
        QPainterPath arrow;
        const bool left = offset == RkStyle::PixmapPrevious;
        arrow.moveTo(left ? 11 : 5, 3);
        arrow.lineTo(left ? 4 : 12, 8);
        arrow.lineTo(left ? 11 : 5, 13);
        arrow.closeSubpath();
        p.fillPath(arrow, ink);
        break;
    }
    case RkStyle::PixmapRefresh: {
        p.drawArc(QRectF(3, 3, 10, 10), 90 * 16, 270 * 16);
        QPainterPath head;
        head.moveTo(8, 0.5);
        head.lineTo(11.5, 3);
        head.lineTo(8, 5.5);
        head.closeSubpath();
        p.fillPath(head, ink);
        break;
    }
    case RkStyle::PixmapListView:
        for (int row = 0; row < 3; ++row) {
            const qreal y = 3.5 + row * 4.5;
            p.drawPoint(QPointF(2.5, y));
            p.drawLine(QPointF(5.5, y), QPointF(13.5, y));
        }
        break;
    case RkStyle::PixmapImageView:
        p.setBrush(palette.color(QPalette::Active, QPalette::Mid));
        for (int i = 0; i < 4; ++i)
            p.drawRect(QRectF(1.5 + (i % 2) * 7, 1.5 + (i / 2) * 7, 5.5, 5.5));
        break;
    case RkStyle::PixmapUVView: {
        p.drawRect(QRectF(1.5, 1.5, 13, 13));
        p.setPen(QPen(palette.color(QPalette::Active, QPalette::Highlight), 1.2));
        const QPointF tri[] = {{4, 12}, {12, 11}, {7, 4}};
        p.drawPolygon(tri, 3);
        break;
    }
    default:
        break;
    }
    return pixmap;
}

bool isCustomPixmap(int offset)
{
    switch (offset) {
    case RkStyle::PixmapUVView:
    case RkStyle::PixmapPrevious:
    case RkStyle::PixmapNext:
    case RkStyle::PixmapRefresh:
    case RkStyle::PixmapListView:
    case RkStyle::PixmapImageView:
        return true;
    default:
        return false;
    }
}

} // namespace

RkStyle::RkStyle(QStyle* base)
    : QProxyStyle(base ? base : QStyleFactory::create(QStringLiteral("Fusion")))
{
    setObjectName(QStringLiteral("RkStyle"));
}

RkStyle::~RkStyle() = default;

int RkStyle::pixelMetric(PixelMetric metric, const QStyleOption* option,
                         const QWidget* widget) const
{
    if (metric >= PM_CustomBase) {
        const int offset = int(metric - PM_CustomBase);
        for (const MetricEntry& entry : metricTable) {
            if (entry.offset == offset)
                return entry.value;
        }
        return 0;
    }
    return QProxyStyle::pixelMetric(metric, option, widget);
}

QIcon RkStyle::standardIcon(StandardPixmap pixmap, const QStyleOption* option,
                            const QWidget* widget) const
{
    if (pixmap >= SP_CustomBase) {
        const int offset = int(pixmap - SP_CustomBase);
        QIcon icon;
        if (!isCustomPixmap(offset))
            return icon;
        const QPalette palette = widget ? widget->palette() : QApplication::palette();
        for (int size : {16, 24, 32, 48})
            icon.addPixmap(drawCustomPixmap(offset, size, palette));
        return icon;
    }
    return QProxyStyle::standardIcon(pixmap, option, widget);
}

QPixmap RkStyle::standardPixmap(StandardPixmap pixmap, const QStyleOption* option,
                                const QWidget* widget) const
{
    if (pixmap >= SP_CustomBase) {
        const int offset = int(pixmap - SP_CustomBase);
        if (!isCustomPixmap(offset))
            return QPixmap();
        return drawCustomPixmap(offset, 16, widget ? widget->palette() : QApplication::palette());
    }
    return QProxyStyle::standardPixmap(pixmap, option, widget);
}

QIcon RkStyle::icon(QStyle::StandardPixmap pixmap)
{
    return QApplication::style()->standardIcon(pixmap);
}

QStyle::PixelMetric RkStyle::customMetric(int offset)
{
    return QStyle::PixelMetric(QStyle::PM_CustomBase + offset);
}

QStyle::StandardPixmap RkStyle::customPixmap(int offset)
{
    return QStyle::StandardPixmap(QStyle::SP_CustomBase + offset);
}

void RkStyle::install()
{
    if (!qobject_cast<RkStyle*>(QApplication::style()))
        QApplication::setStyle(new RkStyle);
}
