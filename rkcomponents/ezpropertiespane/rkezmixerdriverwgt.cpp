#include "rkezmixerdriverwgt.h"

#include "rkezmixerdriver.h"

#include <QMouseEvent>
#include <QPainter>
#include <QPolygon>

#include <algorithm>

namespace
{
constexpr int kSide = 30;
}

RkEzMixerDriverWgt::RkEzMixerDriverWgt(QWidget* parent, RkEzMixerDriver* driver)
    : QWidget(parent), m_driver(driver)
{
    setObjectName(QStringLiteral("ShapeMixerDragger"));
    setFixedSize(kSide, kSide);
    if (driver)
        move(driver->getX() - kSide / 2, driver->getY() - kSide / 2);
}

// A page closed in the middle of a drag still closes the drag's undo hold: left open, it would
// swallow every later change and keep the stack from undoing.
RkEzMixerDriverWgt::~RkEzMixerDriverWgt()
{
    finishDrag();
}

RkEzMixerDriver* RkEzMixerDriverWgt::getDriver() const
{
    return m_driver.data();
}

void RkEzMixerDriverWgt::finishDrag()
{
    if (!m_dragging)
        return;
    m_dragging = false;
    if (m_driver)
        m_driver->endDrag();
}

// Only the left button drags: the other buttons' releases may go to a menu instead.
void RkEzMixerDriverWgt::mousePressEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton || m_dragging) {
        QWidget::mousePressEvent(event);
        return;
    }
    m_dragging = true;
    m_startPos = pos();
    m_startCursor = event->globalPos();
    raise();
    if (m_driver)
        m_driver->startDrag();
    update();
}

void RkEzMixerDriverWgt::mouseMoveEvent(QMouseEvent* event)
{
    if (!m_dragging || !parentWidget())
        return;
    const QPoint p = m_startPos + (event->globalPos() - m_startCursor);
    // A parent smaller than the handle pins it at 0.
    const int x = std::max(std::min(p.x(), parentWidget()->width() - width()), 0);
    const int y = std::max(std::min(p.y(), parentWidget()->height() - height()), 0);
    if (QPoint(x, y) == pos())
        return;
    move(x, y);
    if (m_driver)
        m_driver->moveTo(x + width() / 2, y + height() / 2);
}

void RkEzMixerDriverWgt::mouseReleaseEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton) {
        QWidget::mouseReleaseEvent(event);
        return;
    }
    finishDrag();
    update();
}

void RkEzMixerDriverWgt::enterEvent(QEvent*)
{
    m_hovered = true;
    update();
}

void RkEzMixerDriverWgt::leaveEvent(QEvent*)
{
    m_hovered = false;
    update();
}

void RkEzMixerDriverWgt::paintEvent(QPaintEvent*)
{
    const int w = width();
    const int h = height();
    const int cx = w / 2;
    const int cy = h / 2;
    // Half transparent while dragged, so the thumbnails beneath stay readable.
    const int alpha = m_dragging ? 128 : 255;
    QColor fill = palette().color(QPalette::Mid);
    QColor line = palette().color(QPalette::Highlight);
    fill.setAlpha(alpha);
    line.setAlpha(alpha);

    QPainter painter(this);
    const QRect box(5, 5, w - 11, h - 11);
    if (m_hovered)
        painter.fillRect(box, fill);
    painter.setPen(line);
    painter.drawRect(box);
    painter.setBrush(line);
    painter.drawPolygon(QPolygon({{cx, 0}, {cx - 5, 5}, {cx + 5, 5}}));
    painter.drawPolygon(QPolygon({{cx, h - 1}, {cx - 5, h - 6}, {cx + 5, h - 6}}));
    painter.drawPolygon(QPolygon({{0, cy}, {5, cy - 5}, {5, cy + 5}}));
    painter.drawPolygon(QPolygon({{w - 1, cy}, {w - 6, cy + 5}, {w - 6, cy - 5}}));
}
