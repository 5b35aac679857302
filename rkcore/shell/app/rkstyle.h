#pragma once

#include "rkcoreglobal.h"

#include <QIcon>
#include <QProxyStyle>

// The host style, installed application-wide. It adds the custom pixel metrics and the custom
// standard pixmaps that panes and views size and decorate themselves with (table in rkstyle.cpp)
// and otherwise defers to the base style (Fusion unless another is given).
class RKCORE_EXPORT RkStyle : public QProxyStyle
{
    Q_OBJECT
public:
    // Offsets from QStyle::PM_CustomBase.
    enum Metric {
        MetricSpacing = 0,
        MetricSliderHeight = 9,
        MetricRowHeight = 10,
        MetricDividerHeight = 17,
        MetricViewToolBarHeight = 42,
        MetricMenuButtonExtraWidth = 62,
        MetricListFrameWidth = 64,
    };
    // Offsets from QStyle::SP_CustomBase.
    enum Pixmap {
        PixmapUVView = 21,
        PixmapPrevious = 48,
        PixmapNext = 49,
        PixmapRefresh = 124,
        PixmapListView = 125,
        PixmapImageView = 126,
    };

    explicit RkStyle(QStyle* base = nullptr);
    ~RkStyle() override;

    int pixelMetric(PixelMetric metric, const QStyleOption* option = nullptr,
                    const QWidget* widget = nullptr) const override;
    QIcon standardIcon(StandardPixmap pixmap, const QStyleOption* option = nullptr,
                       const QWidget* widget = nullptr) const override;
    QPixmap standardPixmap(StandardPixmap pixmap, const QStyleOption* option = nullptr,
                           const QWidget* widget = nullptr) const override;

    // The application style's icon for a standard pixmap, custom ones included.
    static QIcon icon(QStyle::StandardPixmap pixmap);
    // Shorthands for the custom entries.
    static QStyle::PixelMetric customMetric(int offset);
    static QStyle::StandardPixmap customPixmap(int offset);

    // Makes an RkStyle the application style (the application owns it) unless one already is.
    static void install();
};
