#include "rkezpropertiesdragger.h"

#include "rkezicongridwgt.h"
#include "undo/rkundostack.h"
#include "undo/rkundostackhold.h"

#include <QLabel>
#include <QMouseEvent>
#include <QPainter>
#include <QPointer>
#include <QPushButton>
#include <QVBoxLayout>

#include <algorithm>

namespace
{

const QString kMixCaption = QStringLiteral("Mixer Drag");

} // namespace

struct RkEzPropertiesDragger::Private {
    QPointer<RkEzIconGridWgt> grid;
    QPoint startPos;
    QPoint startCursor;
    std::unique_ptr<RkUndoStackHold> hold;
    bool dragging = false;
    bool handleVisible = false;
    QPushButton* undoButton = nullptr;
};

RkEzPropertiesDragger::RkEzPropertiesDragger(QWidget* parent, RkEzIconGridWgt* grid)
    : QWidget(parent), d(std::make_unique<Private>())
{
    d->grid = grid;
    setObjectName(QStringLiteral("ShapePropertiesDragger"));
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(10, 10, 10, 10);
    layout->setSpacing(0);
    layout->addWidget(new QWidget(this), 0);

    auto* inner = new QVBoxLayout;
    auto* label = new QLabel(QStringLiteral("Drag\nTo Mix\nMorphs"), this);
    label->setAlignment(Qt::AlignHCenter | Qt::AlignVCenter);
    inner->addWidget(label, 0, Qt::AlignHCenter | Qt::AlignBottom);

    auto* holder = new QWidget(this);
    holder->setFixedSize(34, 18);
    auto* holderLayout = new QVBoxLayout(holder);
    holderLayout->setContentsMargins(0, 0, 0, 0);
    holderLayout->setSpacing(0);
    d->undoButton = new QPushButton(QStringLiteral("Undo"), holder);
    d->undoButton->setObjectName(QStringLiteral("Undo"));
    d->undoButton->hide();
    d->undoButton->move(25, 63);
    d->undoButton->setFixedSize(34, 18);
    holderLayout->addWidget(d->undoButton);
    inner->addWidget(holder, 0, Qt::AlignHCenter | Qt::AlignTop);

    layout->addLayout(inner);
    layout->addWidget(new QWidget(this), 0);

    connect(d->undoButton, &QPushButton::clicked, rkUndoStack, &RkUndoStack::undo);
    connect(rkUndoStack, &RkUndoStack::undoCaptionChanged, this,
            &RkEzPropertiesDragger::undoCaptionChanged);
    undoCaptionChanged(rkUndoStack->getUndoCaption());
}

RkEzPropertiesDragger::~RkEzPropertiesDragger()
{
    endDrag();
}

void RkEzPropertiesDragger::setHandleVisible(bool visible)
{
    d->handleVisible = visible;
}

bool RkEzPropertiesDragger::isDragging() const
{
    return d->dragging;
}

void RkEzPropertiesDragger::undoCaptionChanged(const QString& caption)
{
    d->undoButton->setVisible(caption == kMixCaption);
}

// A press while a drag is still open (its release never came) keeps that drag as its own entry.
void RkEzPropertiesDragger::startDrag(const QPoint& globalPos)
{
    endDrag();
    d->dragging = true;
    d->startPos = pos();
    d->startCursor = globalPos;
    // Ends any hover preview of a tile before its value is taken.
    if (d->grid)
        d->grid->snapshotTileValues();
    d->hold = std::make_unique<RkUndoStackHold>();
    update();
}

void RkEzPropertiesDragger::endDrag()
{
    if (!d->dragging)
        return;
    d->dragging = false;
    move(d->startPos);
    if (d->hold) {
        // Taken out first: accepting changes the undo caption, whose slot sees a closed drag.
        const std::unique_ptr<RkUndoStackHold> hold = std::move(d->hold);
        if (d->grid && d->grid->tileValuesChanged())
            hold->accept(kMixCaption);
        else
            hold->cancel();
    }
    update();
}

void RkEzPropertiesDragger::mousePressEvent(QMouseEvent* event)
{
    startDrag(event->globalPos());
}

void RkEzPropertiesDragger::mouseMoveEvent(QMouseEvent* event)
{
    if (!d->dragging)
        startDrag(event->globalPos());
    if (!d->grid)
        return;
    const QPoint p = d->startPos + (event->globalPos() - d->startCursor);
    const QRect b = d->grid->draggerBounds();
    move(std::max(b.left(), std::min(p.x(), b.right())),
         std::max(b.top(), std::min(p.y(), b.bottom())));
    // No clamping here: each tile adds the handle's closeness to its snapshot, and a clamped
    // morph limits itself.
    d->grid->mixTilesAt(pos().x(), pos().y());
}

void RkEzPropertiesDragger::mouseReleaseEvent(QMouseEvent*)
{
    endDrag();
}

void RkEzPropertiesDragger::paintEvent(QPaintEvent* event)
{
    QWidget::paintEvent(event);
    if (!d->handleVisible)
        return;
    const int w = width();
    const int h = height();
    const int cx = w / 2;
    const int cy = h / 2;
    const int alpha = d->hold ? 128 : 255;
    QColor fill = palette().color(QPalette::Mid);
    QColor line = palette().color(QPalette::Highlight);
    fill.setAlpha(alpha);
    line.setAlpha(alpha);

    QPainter p(this);
    const QRect box(10, 10, w - 21, h - 21);
    p.fillRect(box, fill);
    p.setPen(line);
    p.drawRect(box);

    p.setBrush(line);
    const QPolygon arrows[] = {
        QPolygon({QPoint(cx, 0), QPoint(cx - 10, 10), QPoint(cx + 10, 10)}),
        QPolygon({QPoint(cx, h - 1), QPoint(cx - 10, h - 11), QPoint(cx + 10, h - 11)}),
        QPolygon({QPoint(0, cy), QPoint(10, cy - 10), QPoint(10, cy + 10)}),
        QPolygon({QPoint(w - 1, cy), QPoint(w - 11, cy + 10), QPoint(w - 11, cy - 10)}),
    };
    for (const QPolygon& arrow : arrows)
        p.drawPolygon(arrow, Qt::OddEvenFill);
}
