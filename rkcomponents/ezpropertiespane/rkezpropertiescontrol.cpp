#include "rkezpropertiescontrol.h"

#include "properties/rkfloatproperty.h"
#include "rkezmorphedit.h"
#include "undo/rkundostack.h"
#include "widgets/rkfloatslider.h"

#include <QApplication>
#include <QDrag>
#include <QFrame>
#include <QHBoxLayout>
#include <QLabel>
#include <QMimeData>
#include <QMouseEvent>
#include <QPainter>
#include <QPointer>
#include <QStyle>
#include <QVBoxLayout>
#include <QVector3D>

struct RkEzPropertiesControl::Private {
    RkEzIconGridWgt* grid = nullptr;
    // The morph belongs to its node; the guard turns null when the node deletes it.
    QPointer<RkFloatProperty> property;
    QFrame* imageFrame = nullptr;
    QFrame* labelFrame = nullptr;
    QLabel* nameLabel = nullptr;
    QLabel* valueLabel = nullptr;
    RkFloatSlider* slider = nullptr;
    float snapshotValue = 0.f;
    bool hasImage = false;
    QImage image;
    bool updatingFromProperty = false;
    bool updatingFromSlider = false;
    // At most one hold: a preview's or a slider gesture's.
    RkEzMorphEdit edit;
    bool pointerOverImage = false;
    bool pressed = false;
    QPoint pressPos;
};

RkEzPropertiesControl::RkEzPropertiesControl(RkFloatProperty* property, QWidget* parent,
                                             RkEzIconGridWgt* grid)
    : QWidget(parent), d(std::make_unique<Private>())
{
    d->property = property;
    d->grid = grid;
    setObjectName(QStringLiteral("ShapePropertiesIconControl"));
    QSizePolicy policy(QSizePolicy::Minimum, QSizePolicy::Minimum);
    policy.setHeightForWidth(true);
    setSizePolicy(policy);

    const int m = style()->pixelMetric(QStyle::PM_CustomBase);
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);

    d->imageFrame = new QFrame(this);
    d->imageFrame->setFrameStyle(QFrame::Box | QFrame::Plain);
    d->imageFrame->setContentsMargins(1, 1, 1, 1);
    d->imageFrame->installEventFilter(this);
    auto* imageLayout = new QHBoxLayout(d->imageFrame);
    imageLayout->setContentsMargins(0, 0, 0, 0);
    imageLayout->setSpacing(0);
    layout->addWidget(d->imageFrame, 100);

    d->valueLabel = new QLabel(d->imageFrame);
    d->valueLabel->setContentsMargins(0, 0, m, 0);
    imageLayout->addWidget(d->valueLabel, 0, Qt::AlignRight | Qt::AlignBottom);

    d->labelFrame = new QFrame(this);
    d->labelFrame->setFrameStyle(QFrame::Box | QFrame::Plain);
    d->labelFrame->setContentsMargins(1, 0, 1, 1);
    d->labelFrame->installEventFilter(this);
    d->labelFrame->setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Preferred);
    auto* labelLayout = new QHBoxLayout(d->labelFrame);
    labelLayout->setContentsMargins(0, 0, 0, 0);
    labelLayout->setSpacing(0);
    layout->addWidget(d->labelFrame, 0);

    d->nameLabel = new QLabel(property ? property->getLabel() : QString(), d->labelFrame);
    d->nameLabel->setContentsMargins(m, 0, 0, 0);
    labelLayout->addWidget(d->nameLabel);

    // Not in a layout: it covers the name label while the pointer is on the strip.
    d->slider = new RkFloatSlider(d->nameLabel, QString());
    d->slider->setTextVisible(false);
    d->slider->installEventFilter(this);
    d->slider->hide();

    updateInternalSlider();
    currentValueChanged();

    if (property) {
        connect(property, &RkProperty::currentValueChanged, this,
                &RkEzPropertiesControl::currentValueChanged);
        connect(property, &RkProperty::labelChanged, this,
                &RkEzPropertiesControl::updateInternalSlider);
        connect(property, &RkNumericProperty::clampedChanged, this,
                &RkEzPropertiesControl::updateInternalSlider);
        connect(property, &RkNumericProperty::minMaxChanged, this,
                &RkEzPropertiesControl::updateInternalSlider);
        connect(property, &RkFloatProperty::displayAsPercentChanged, this,
                &RkEzPropertiesControl::updateInternalSlider);
        connect(property, &QObject::destroyed, this, &RkEzPropertiesControl::propertyDestroyed);
    }
    connect(d->slider, &RkFloatSlider::valueChanged, this,
            &RkEzPropertiesControl::sliderValueChanged);
    connect(d->slider, &RkSlider::editStart, this, &RkEzPropertiesControl::editStart);
    connect(d->slider, &RkSlider::editEnd, this, &RkEzPropertiesControl::editEnd);
    connect(d->slider, &RkSlider::editCancelled, this, &RkEzPropertiesControl::editCancelled);
}

RkEzPropertiesControl::~RkEzPropertiesControl()
{
    // The children outlive this part of the object: nothing of theirs may call back into it.
    d->slider->disconnect(this);
    d->slider->removeEventFilter(this);
    d->imageFrame->removeEventFilter(this);
    d->labelFrame->removeEventFilter(this);
    // A tile removed in the middle of a gesture keeps what the gesture did, as a hidden slider
    // does, and a preview goes back: either way the undo stack is free again.
    d->edit.close(d->property);
}

RkEzIconGridWgt* RkEzPropertiesControl::getGrid() const
{
    return d->grid;
}

RkFloatProperty* RkEzPropertiesControl::getProperty() const
{
    return d->property.data();
}

void RkEzPropertiesControl::currentValueChanged()
{
    if (!d->property)
        return;
    d->updatingFromProperty = true;
    const float value = d->property->getValue();
    d->valueLabel->setText(QStringLiteral("%0%").arg(int(value * 100.f)));
    if (!d->updatingFromSlider)
        d->slider->setValue(value);
    d->updatingFromProperty = false;
}

void RkEzPropertiesControl::updateInternalSlider()
{
    if (!d->property)
        return;
    d->nameLabel->setText(d->property->getLabel());
    RkEzMorphEdit::configure(d->slider, d->property);
}

void RkEzPropertiesControl::sliderValueChanged(float value)
{
    d->updatingFromSlider = true;
    if (!d->updatingFromProperty && d->property)
        d->property->adjustValue(value);
    d->updatingFromSlider = false;
}

void RkEzPropertiesControl::editStart()
{
    d->edit.start(d->property, "RkEzPropertiesControl::editStart()");
}

void RkEzPropertiesControl::editEnd()
{
    d->edit.end(d->property);
}

void RkEzPropertiesControl::editCancelled()
{
    d->edit.cancel(d->property);
}

void RkEzPropertiesControl::beginPreview()
{
    d->edit.beginPreview(d->property);
}

void RkEzPropertiesControl::endPreview()
{
    d->edit.endPreview(d->property);
}

bool RkEzPropertiesControl::isPreviewing() const
{
    return d->edit.isPreviewing();
}

void RkEzPropertiesControl::propertyDestroyed()
{
    // The property is gone already: drop the hold without touching it, then show nothing of it.
    d->edit.drop();
    d->hasImage = false;
    d->image = QImage();
    d->nameLabel->clear();
    d->valueLabel->clear();
    // Hiding ends a running slider gesture, which finds nothing left to do.
    d->slider->hide();
    d->pressed = false;
    setEnabled(false);
    update();
}

void RkEzPropertiesControl::setImage(const QImage& image)
{
    d->image = image;
    d->hasImage = true;
    update();
}

QImage RkEzPropertiesControl::getImage() const
{
    return d->image;
}

QSize RkEzPropertiesControl::getImageSize() const
{
    return d->imageFrame->size();
}

void RkEzPropertiesControl::takeValueSnapshot()
{
    endPreview();
    if (d->property)
        d->snapshotValue = d->property->getValue();
}

bool RkEzPropertiesControl::differsFromSnapshot() const
{
    if (!d->property)
        return false;
    // An unordered comparison counts as different.
    return !(d->property->getValue() == d->snapshotValue);
}

void RkEzPropertiesControl::mixAt(int x, int y)
{
    if (!d->property)
        return;
    const float distance = QVector3D(pos().x() - x, pos().y() - y, 0).length();
    const float radius = float(qMin(width(), height()));
    const float influence = radius > distance ? 1.f - distance / radius : 0.f;
    // A tile the dragger has left returns to its snapshot value.
    const float target = d->snapshotValue + influence;
    if (target != d->property->getValue())
        d->property->setValue(target);
}

void RkEzPropertiesControl::setHighlighted(bool on)
{
    QPalette pal = palette();
    const QColor colour = pal.brush(on ? QPalette::Highlight : QPalette::WindowText).color();
    pal.setBrush(QPalette::All, QPalette::WindowText, QBrush(colour));
    d->imageFrame->setPalette(pal);
    d->labelFrame->setPalette(pal);
    update();
}

bool RkEzPropertiesControl::isPointerOverImage() const
{
    return d->pointerOverImage;
}

void RkEzPropertiesControl::setPointerOverImage(bool on)
{
    d->pointerOverImage = on;
}

RkFloatSlider* RkEzPropertiesControl::getSlider() const
{
    return d->slider;
}

QSize RkEzPropertiesControl::sizeHint() const
{
    return QSize(50, heightForWidth(50));
}

int RkEzPropertiesControl::heightForWidth(int width) const
{
    // The thumbnail area stays square.
    return width + d->labelFrame->height();
}

bool RkEzPropertiesControl::eventFilter(QObject* watched, QEvent* event)
{
    const QEvent::Type type = event->type();
    if (watched == d->imageFrame) {
        if (type == QEvent::Enter) {
            d->pointerOverImage = true;
            // Someone else's open edit keeps the preview off.
            if (!rkUndoStack || !rkUndoStack->canPushItems())
                beginPreview();
        } else if (type == QEvent::Leave) {
            d->pointerOverImage = false;
            endPreview();
        }
    } else if (watched == d->labelFrame) {
        if (type == QEvent::Enter && d->property)
            d->slider->show();
        else if (type == QEvent::Leave)
            d->slider->hide();
    } else if (watched == d->slider && type == QEvent::Show) {
        d->slider->resize(d->nameLabel->size());
    }
    return QWidget::eventFilter(watched, event);
}

void RkEzPropertiesControl::mousePressEvent(QMouseEvent* event)
{
    d->pressed = true;
    d->pressPos = event->pos();
}

void RkEzPropertiesControl::mouseReleaseEvent(QMouseEvent*)
{
    d->pressed = false;
}

void RkEzPropertiesControl::mouseMoveEvent(QMouseEvent* event)
{
    if (!d->pressed || !(event->buttons() & Qt::LeftButton) || !d->property ||
        (d->pressPos - event->pos()).manhattanLength() <= QApplication::startDragDistance())
        return;
    // A receiver knows the tile by the drag's source.
    auto* drag = new QDrag(this);
    auto* mime = new QMimeData;
    mime->setData(QStringLiteral("text"), d->property->getLabel().toLatin1());
    drag->setMimeData(mime);
    drag->exec(Qt::CopyAction);
}

void RkEzPropertiesControl::enterEvent(QEvent*)
{
    setHighlighted(true);
}

void RkEzPropertiesControl::leaveEvent(QEvent*)
{
    setHighlighted(false);
}

void RkEzPropertiesControl::paintEvent(QPaintEvent*)
{
    QPainter p(this);
    if (!d->hasImage || d->image.isNull())
        return;
    const QSize frame = d->imageFrame->size();
    if (frame.isEmpty())
        return;
    const double frameAspect = double(frame.width()) / frame.height();
    const double imageAspect = double(d->image.width()) / d->image.height();
    // A relatively wider image fills the height and is cut off left and right.
    const Qt::AspectRatioMode mode =
        imageAspect < frameAspect ? Qt::KeepAspectRatio : Qt::KeepAspectRatioByExpanding;
    const QImage scaled = d->image.scaled(frame, mode, Qt::SmoothTransformation);
    p.drawImage(frame.width() / 2 - scaled.width() / 2, frame.height() / 2 - scaled.height() / 2,
                scaled);
}
