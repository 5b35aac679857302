#include "rkezmixercontrolwgt.h"

#include "properties/rkfloatproperty.h"
#include "rkezmixer.h"
#include "rkezmixercontrol.h"

#include <QBitmap>
#include <QContextMenuEvent>
#include <QMenu>
#include <QMouseEvent>
#include <QPainter>

#include <algorithm>

namespace
{
constexpr int kPlaceholderSide = 85;
}

RkEzMixerControlWgt::RkEzMixerControlWgt(QWidget* parent, RkEzMixerControl* control)
    : QWidget(parent), m_control(control)
{
    setObjectName(QStringLiteral("ShapeMixerControl"));
    setContextMenuPolicy(Qt::DefaultContextMenu);
    const QImage image = control ? control->getImage() : QImage();
    // Only an image with an alpha channel has pixels that let the mouse through.
    const QBitmap mask = image.hasAlphaChannel()
                             ? QBitmap::fromImage(image.createAlphaMask(Qt::ThresholdDither))
                             : QBitmap();
    // A thumbnail that failed to decode, was never made or is clear throughout would leave a
    // widget that nobody could see or delete: such a control gets a box of a tile's size.
    m_placeholder = image.isNull() || (!mask.isNull() && QRegion(mask).isEmpty());
    if (m_placeholder) {
        setFixedSize(kPlaceholderSide, kPlaceholderSide);
    } else {
        setFixedSize(image.size());
        if (!mask.isNull())
            setMask(mask);
    }
    if (control)
        move(control->getX() - width() / 2, control->getY() - height() / 2);
}

RkEzMixerControlWgt::~RkEzMixerControlWgt() = default;

RkEzMixerControl* RkEzMixerControlWgt::getControl() const
{
    return m_control.data();
}

bool RkEzMixerControlWgt::isPlaceholder() const
{
    return m_placeholder;
}

QString RkEzMixerControlWgt::placeholderText() const
{
    // The morph may have been deleted with its node; the control outlives it.
    const RkFloatProperty* property = m_control ? m_control->getControlProperty() : nullptr;
    return property ? property->getLabel() : tr("Unnamed");
}

// Only the left button drags: the right one opens the menu, which takes its release.
void RkEzMixerControlWgt::mousePressEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton || m_dragging) {
        QWidget::mousePressEvent(event);
        return;
    }
    m_dragging = true;
    m_startPos = pos();
    m_startCursor = event->globalPos();
    raise();
}

void RkEzMixerControlWgt::mouseMoveEvent(QMouseEvent* event)
{
    if (!m_dragging || !parentWidget())
        return;
    const QPoint p = m_startPos + (event->globalPos() - m_startCursor);
    const int x = std::max(std::min(p.x(), parentWidget()->width() - width()), 0);
    const int y = std::max(std::min(p.y(), parentWidget()->height() - height()), 0);
    if (QPoint(x, y) == pos())
        return;
    move(x, y);
    // The new point counts from the mixer's next drive.
    if (m_control) {
        m_control->setX(x + width() / 2);
        m_control->setY(y + height() / 2);
    }
}

void RkEzMixerControlWgt::mouseReleaseEvent(QMouseEvent* event)
{
    if (event->button() == Qt::LeftButton)
        m_dragging = false;
    else
        QWidget::mouseReleaseEvent(event);
}

void RkEzMixerControlWgt::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    if (!m_placeholder) {
        if (m_control)
            painter.drawImage(0, 0, m_control->getImage());
        return;
    }
    painter.fillRect(rect(), palette().color(QPalette::Button));
    painter.setPen(palette().color(QPalette::Mid));
    painter.drawRect(rect().adjusted(0, 0, -1, -1));
    painter.setPen(palette().color(QPalette::ButtonText));
    painter.drawText(rect().adjusted(3, 3, -3, -3), Qt::AlignCenter | Qt::TextWordWrap,
                     placeholderText());
}

void RkEzMixerControlWgt::contextMenuEvent(QContextMenuEvent* event)
{
    // Not run in a loop of its own: "Delete" deletes this widget, and the menu with it.
    auto* menu = new QMenu(this);
    menu->setAttribute(Qt::WA_DeleteOnClose);
    menu->addAction(tr("Delete"), this, &RkEzMixerControlWgt::remove);
    menu->popup(event->globalPos());
}

// Deleting a control is not undoable.
void RkEzMixerControlWgt::remove()
{
    if (m_control && m_control->getMixer())
        m_control->getMixer()->removeControl(m_control);
    // The menu's event that called this is still on the stack.
    deleteLater();
}
