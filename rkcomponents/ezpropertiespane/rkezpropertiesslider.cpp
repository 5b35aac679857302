#include "rkezpropertiesslider.h"

#include "properties/rkfloatproperty.h"
#include "rkezcompressedslider.h"
#include "rkezmorphedit.h"
#include "undo/rkundostack.h"
#include "widgets/rkfloatpropertywgt.h"

#include <QEvent>
#include <QHBoxLayout>
#include <QLabel>
#include <QPainter>
#include <QPointer>

struct RkEzPropertiesSlider::Private {
    QWidget* owner = nullptr;
    // The morph belongs to its node; the guard turns null when the node deletes it.
    QPointer<RkFloatProperty> property;
    // Hidden: it only supplies the options dialog.
    RkFloatPropertyWgt* propertyWgt = nullptr;
    QLabel* nameLabel = nullptr;
    RkEzCompressedSlider* slider = nullptr;
    bool updatingFromProperty = false;
    bool updatingFromSlider = false;
    // At most one hold: a preview's or a slider gesture's.
    RkEzMorphEdit edit;
    bool hovered = false;
};

RkEzPropertiesSlider::RkEzPropertiesSlider(RkFloatProperty* property, QWidget* parent,
                                           QWidget* owner)
    : QWidget(parent), d(std::make_unique<Private>())
{
    d->owner = owner;
    d->property = property;
    setObjectName(QStringLiteral("ShapePropertiesListControl"));
    auto* layout = new QHBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);

    d->nameLabel = new QLabel(property ? property->getLabel() : QString(), this);
    d->nameLabel->setFixedWidth(100);
    d->nameLabel->installEventFilter(this);
    layout->addWidget(d->nameLabel, 0);

    d->propertyWgt =
        new RkFloatPropertyWgt(this, QStringLiteral("RkEzPropertiesSliderInternalPropWgt"));
    if (property)
        d->propertyWgt->addProperty(property);
    d->propertyWgt->hide();

    d->slider =
        new RkEzCompressedSlider(this, QStringLiteral("RkEzPropertiesSliderInternalSlider"));
    d->slider->setTextEditable(true);
    d->slider->installEventFilter(this);
    layout->addWidget(d->slider, 0);

    updateInternalSlider();
    currentValueChanged();

    if (property) {
        connect(property, &RkProperty::currentValueChanged, this,
                &RkEzPropertiesSlider::currentValueChanged);
        connect(property, &RkProperty::labelChanged, this,
                &RkEzPropertiesSlider::updateInternalSlider);
        connect(property, &RkNumericProperty::clampedChanged, this,
                &RkEzPropertiesSlider::updateInternalSlider);
        connect(property, &RkNumericProperty::minMaxChanged, this,
                &RkEzPropertiesSlider::updateInternalSlider);
        connect(property, &RkFloatProperty::displayAsPercentChanged, this,
                &RkEzPropertiesSlider::updateInternalSlider);
        connect(property, &QObject::destroyed, this, &RkEzPropertiesSlider::propertyDestroyed);
    }
    connect(d->slider, &RkFloatSlider::valueChanged, this,
            &RkEzPropertiesSlider::sliderValueChanged);
    connect(d->slider, &RkSlider::editStart, this, &RkEzPropertiesSlider::editStart);
    connect(d->slider, &RkSlider::editEnd, this, &RkEzPropertiesSlider::editEnd);
    connect(d->slider, &RkSlider::editCancelled, this, &RkEzPropertiesSlider::editCancelled);
}

RkEzPropertiesSlider::~RkEzPropertiesSlider()
{
    // The children outlive this part of the object: nothing of theirs may call back into it.
    d->slider->disconnect(this);
    d->slider->removeEventFilter(this);
    d->nameLabel->removeEventFilter(this);
    // A row removed in the middle of a gesture keeps what the gesture did, as a hidden slider
    // does, and a preview goes back: either way the undo stack is free again.
    d->edit.close(d->property);
}

QWidget* RkEzPropertiesSlider::getOwner() const
{
    return d->owner;
}

RkFloatProperty* RkEzPropertiesSlider::getProperty() const
{
    return d->property.data();
}

RkEzCompressedSlider* RkEzPropertiesSlider::getSlider() const
{
    return d->slider;
}

void RkEzPropertiesSlider::setLabelWidth(int width)
{
    d->nameLabel->setFixedWidth(qMax(width, 0));
}

int RkEzPropertiesSlider::labelTextWidth() const
{
    if (!d->property)
        return 0;
    // The advance, not the ink's bounding box: the box can be narrower, and a name fitted to it
    // would still be elided.
    return d->nameLabel->fontMetrics().horizontalAdvance(d->property->getLabel());
}

void RkEzPropertiesSlider::showLabel()
{
    if (!d->property)
        return;
    d->nameLabel->setText(d->nameLabel->fontMetrics().elidedText(
        d->property->getLabel(), Qt::ElideRight, d->nameLabel->width()));
}

void RkEzPropertiesSlider::currentValueChanged()
{
    if (!d->property)
        return;
    d->updatingFromProperty = true;
    if (!d->updatingFromSlider)
        d->slider->setValue(d->property->getValue());
    d->updatingFromProperty = false;
}

void RkEzPropertiesSlider::updateInternalSlider()
{
    if (!d->property)
        return;
    showLabel();
    RkEzMorphEdit::configure(d->slider, d->property);
}

void RkEzPropertiesSlider::sliderValueChanged(float value)
{
    d->updatingFromSlider = true;
    if (!d->updatingFromProperty && d->property)
        d->property->adjustValue(value);
    d->updatingFromSlider = false;
}

void RkEzPropertiesSlider::editStart()
{
    d->edit.start(d->property, "RkEzPropertiesSlider::editStart()");
}

void RkEzPropertiesSlider::editEnd()
{
    d->edit.end(d->property);
}

void RkEzPropertiesSlider::editCancelled()
{
    d->edit.cancel(d->property);
}

void RkEzPropertiesSlider::beginPreview()
{
    d->edit.beginPreview(d->property);
}

void RkEzPropertiesSlider::endPreview()
{
    d->edit.endPreview(d->property);
}

bool RkEzPropertiesSlider::isPreviewing() const
{
    return d->edit.isPreviewing();
}

void RkEzPropertiesSlider::propertyDestroyed()
{
    // The property is gone already: drop the hold without touching it, then show nothing of it.
    d->edit.drop();
    d->hovered = false;
    d->nameLabel->clear();
    // Hiding ends a running slider gesture, which finds nothing left to do.
    d->slider->hide();
    setEnabled(false);
    update();
}

bool RkEzPropertiesSlider::eventFilter(QObject* watched, QEvent* event)
{
    if (watched != d->nameLabel)
        return QWidget::eventFilter(watched, event);
    switch (event->type()) {
    case QEvent::Enter:
        if (!d->property)
            break;
        d->hovered = true;
        // Someone else's open edit keeps the preview off.
        if (!rkUndoStack || !rkUndoStack->canPushItems())
            beginPreview();
        update();
        break;
    case QEvent::Leave:
        d->hovered = false;
        endPreview();
        update();
        break;
    case QEvent::MouseButtonDblClick:
        endPreview();
        d->propertyWgt->doOptionsDialog();
        return false;
    case QEvent::Resize:
        showLabel();
        break;
    default:
        break;
    }
    return QWidget::eventFilter(watched, event);
}

void RkEzPropertiesSlider::paintEvent(QPaintEvent*)
{
    if (!d->hovered)
        return;
    QPainter p(this);
    p.fillRect(d->nameLabel->geometry(), palette().color(QPalette::Highlight));
}
