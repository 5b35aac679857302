#include "widgets/rkdividerbar.h"

#include <QApplication>
#include <QMouseEvent>
#include <QPainter>
#include <QPainterPath>
#include <QStyle>

#include <algorithm>
#include <cstdlib>

namespace
{

// Divider thickness of the host style (a custom metric); other styles give 0.
constexpr int dividerThicknessMetric = 17;
constexpr int gripDotSpacing = 4;

int barThickness(const QWidget* bar)
{
    const int t = bar->style()->pixelMetric(
        QStyle::PixelMetric(QStyle::PM_CustomBase + dividerThicknessMetric));
    return t > 0 ? t : 8;
}

// The toggle button sits in the middle of the bar; empty when the bar shows none.
QRect toggleButtonRect(const RkDividerBar* bar)
{
    if (bar->barStyle() != RkDividerBar::GripToggleBar || !bar->isToggleBarEnabled())
        return QRect();
    const bool horizontal = bar->orientation() == Qt::Horizontal;
    const int thickness = horizontal ? bar->height() : bar->width();
    const int length = std::max(20, 3 * thickness);
    QRect button = horizontal ? QRect(0, 0, length, thickness) : QRect(0, 0, thickness, length);
    button.moveCenter(bar->rect().center());
    return button;
}

} // namespace

struct RkDividerBar::Private {
    Qt::Orientation orientation = Qt::Horizontal;
    BarStyle style = GripBar;
    bool toggleEnabled = false;
    bool pressed = false;
    bool pressedOnButton = false;
    bool dragging = false;
    // Positions across the bar in global coordinates: the bar itself moves while it is dragged.
    int pressAt = 0;
    int reportedAt = 0;
};

RkDividerBar::RkDividerBar(QWidget* parent, Qt::Orientation orientation, const QString& name,
                           BarStyle style)
    : QWidget(parent), d(std::make_unique<Private>())
{
    setObjectName(name);
    d->orientation = orientation;
    d->style = style;
    setAttribute(Qt::WA_Hover);
    setMouseTracking(true);
    setCursor(orientation == Qt::Horizontal ? Qt::SplitVCursor : Qt::SplitHCursor);
    if (orientation == Qt::Horizontal)
        setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Fixed);
    else
        setSizePolicy(QSizePolicy::Fixed, QSizePolicy::Expanding);
}

RkDividerBar::~RkDividerBar() = default;

Qt::Orientation RkDividerBar::orientation() const
{
    return d->orientation;
}

RkDividerBar::BarStyle RkDividerBar::barStyle() const
{
    return d->style;
}

void RkDividerBar::enableToggleBar(bool enable)
{
    d->toggleEnabled = enable;
    update();
}

bool RkDividerBar::isToggleBarEnabled() const
{
    return d->toggleEnabled;
}

QSize RkDividerBar::sizeHint() const
{
    const int t = barThickness(this);
    return d->orientation == Qt::Horizontal ? QSize(100, t) : QSize(t, 100);
}

QSize RkDividerBar::minimumSizeHint() const
{
    const int t = barThickness(this);
    return d->orientation == Qt::Horizontal ? QSize(3 * t, t) : QSize(t, 3 * t);
}

void RkDividerBar::paintEvent(QPaintEvent*)
{
    QPainter p(this);
    const bool horizontal = d->orientation == Qt::Horizontal;
    QColor background = palette().color(QPalette::Window);
    if (underMouse() || d->pressed)
        background = background.darker(108);
    p.fillRect(rect(), background);

    const QPoint c = rect().center();
    if (d->style == PlainBar) {
        p.setPen(palette().color(QPalette::Mid));
        if (horizontal)
            p.drawLine(0, c.y(), width() - 1, c.y());
        else
            p.drawLine(c.x(), 0, c.x(), height() - 1);
        return;
    }

    // Embossed dots along the middle of the bar, on both sides of the toggle button if any.
    const QRect button = toggleButtonRect(this);
    const int dotsPerSide = button.isNull() ? 4 : 3;
    const int gap = button.isNull() ? 0 : (horizontal ? button.width() : button.height()) / 2 + 2;
    for (int side : {-1, 1}) {
        for (int i = 0; i < dotsPerSide; ++i) {
            const int along = side * (gap + gripDotSpacing / 2 + i * gripDotSpacing);
            const QPoint dot =
                horizontal ? QPoint(c.x() + along, c.y()) : QPoint(c.x(), c.y() + along);
            p.fillRect(QRect(dot, QSize(2, 2)), palette().color(QPalette::Light));
            p.fillRect(QRect(dot - QPoint(1, 1), QSize(2, 2)), palette().color(QPalette::Dark));
        }
    }
    if (button.isNull())
        return;

    // Two small opposite arrows: the button folds or unfolds the area next to the bar.
    p.setRenderHint(QPainter::Antialiasing);
    p.setPen(palette().color(QPalette::Mid));
    p.setBrush(palette().color(QPalette::Button));
    p.drawRoundedRect(QRectF(button).adjusted(0.5, 0.5, -0.5, -0.5), 2, 2);
    const qreal s = std::max(2.0, (horizontal ? button.height() : button.width()) / 2.0 - 1.5);
    const QPointF mid = QRectF(button).center();
    QPainterPath arrows;
    for (int side : {-1, 1}) {
        const qreal o = side * (s + 1);
        if (horizontal) {
            arrows.moveTo(mid.x() + o - s, mid.y() - side * s / 2);
            arrows.lineTo(mid.x() + o + s, mid.y() - side * s / 2);
            arrows.lineTo(mid.x() + o, mid.y() + side * s / 2);
        } else {
            arrows.moveTo(mid.x() - side * s / 2, mid.y() + o - s);
            arrows.lineTo(mid.x() - side * s / 2, mid.y() + o + s);
            arrows.lineTo(mid.x() + side * s / 2, mid.y() + o);
        }
        arrows.closeSubpath();
    }
    p.fillPath(arrows, palette().color(QPalette::ButtonText));
}

void RkDividerBar::mousePressEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton) {
        QWidget::mousePressEvent(event);
        return;
    }
    const int across = d->orientation == Qt::Horizontal ? event->globalY() : event->globalX();
    d->pressed = true;
    d->pressedOnButton = toggleButtonRect(this).contains(event->pos());
    // Without the toggle bar every pixel counts; with it a click must stay a click.
    d->dragging = !d->toggleEnabled;
    d->pressAt = across;
    d->reportedAt = across;
    event->accept();
    update();
}

void RkDividerBar::mouseMoveEvent(QMouseEvent* event)
{
    if (!d->pressed) {
        const bool overButton = toggleButtonRect(this).contains(event->pos());
        if (overButton)
            setCursor(Qt::ArrowCursor);
        else
            setCursor(d->orientation == Qt::Horizontal ? Qt::SplitVCursor : Qt::SplitHCursor);
        return;
    }
    if (d->pressedOnButton)
        return;
    const int across = d->orientation == Qt::Horizontal ? event->globalY() : event->globalX();
    if (!d->dragging && std::abs(across - d->pressAt) >= QApplication::startDragDistance())
        d->dragging = true;
    if (d->dragging && across != d->reportedAt) {
        const int delta = across - d->reportedAt;
        d->reportedAt = across;
        Q_EMIT moved(delta);
    }
}

void RkDividerBar::mouseReleaseEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton || !d->pressed) {
        QWidget::mouseReleaseEvent(event);
        return;
    }
    const int across = d->orientation == Qt::Horizontal ? event->globalY() : event->globalX();
    const bool onButton = d->pressedOnButton;
    const bool dragging = d->dragging;
    d->pressed = false;
    d->pressedOnButton = false;
    d->dragging = false;
    event->accept();
    update();
    if (onButton) {
        if (toggleButtonRect(this).contains(event->pos()))
            Q_EMIT toggleBarActivated();
    } else if (dragging) {
        if (across != d->reportedAt)
            Q_EMIT moved(across - d->reportedAt);
    } else if (d->toggleEnabled) {
        Q_EMIT toggleBarActivated();
    }
}
