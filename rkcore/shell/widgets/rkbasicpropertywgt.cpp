#include "widgets/rkbasicpropertywgt.h"

#include "properties/rkproperty.h"
#include "undo/rkundostackhold.h"
#include "widgets/rkslider.h"

#include <QHBoxLayout>
#include <QMouseEvent>
#include <QPointer>
#include <QSignalBlocker>
#include <QStyle>

struct RkBasicPropertyWgt::Private {
    std::unique_ptr<RkUndoStackHold> hold; // open from the start of a gesture to its end
    QList<QPointer<RkProperty>> editing;   // the properties the open gesture began editing
    QPointer<RkSlider> slider;
    bool barOnHover = false;
    bool hovered = false;
};

RkBasicPropertyWgt::RkBasicPropertyWgt(QWidget* parent, const QString& name)
    : RkPropertyWgt(parent), d(std::make_unique<Private>())
{
    setObjectName(name);
    const int m = style()->pixelMetric(QStyle::PM_CustomBase);
    auto* layout = new QHBoxLayout(this);
    layout->setContentsMargins(m, m / 2, m, m / 2);
    layout->setSpacing(m);
    setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Fixed);
}

RkBasicPropertyWgt::~RkBasicPropertyWgt()
{
    // A widget deleted in the middle of a gesture takes the gesture back. The slider goes later,
    // with the children: nothing it still says may reach this half-destroyed widget.
    if (d->slider)
        disconnect(d->slider, nullptr, this, nullptr);
    cancelPropertyEdit();
}

void RkBasicPropertyWgt::setSelected(bool selected)
{
    RkPropertyWgt::setSelected(selected);
    if (d->slider)
        d->slider->setSelected(selected);
}

void RkBasicPropertyWgt::removeAllProperties()
{
    if (d->slider)
        d->slider->finishEditing();
    if (d->hold)
        finishPropertyEdit();
    RkPropertyWgt::removeAllProperties();
}

bool RkBasicPropertyWgt::doOptionsDialog()
{
    return false;
}

void RkBasicPropertyWgt::updateFromProperties()
{
    if (d->slider) {
        const RkProperty* first = getFirstProperty();
        const QSignalBlocker blocker(d->slider);
        d->slider->setLabel(first ? first->getLabel() : QString());
        d->slider->setMixed(first && arePropertiesMixed());
        d->slider->setEnabled(first && arePropertiesEditable());
    }
    RkPropertyWgt::updateFromProperties();
}

void RkBasicPropertyWgt::mouseDoubleClickEvent(QMouseEvent* event)
{
    // The slider keeps double-clicks on its bar and value; one on the label reaches here.
    if (event->button() == Qt::LeftButton && !getProperties().isEmpty()) {
        event->accept();
        doOptionsDialog();
        return;
    }
    RkPropertyWgt::mouseDoubleClickEvent(event);
}

void RkBasicPropertyWgt::beginPropertyEdit()
{
    // A gesture left open (its end never came) is kept as it stands.
    if (d->hold)
        finishPropertyEdit();
    d->hold = std::make_unique<RkUndoStackHold>();
    for (RkProperty* property : getProperties()) {
        property->beginEdit();
        d->editing.append(property);
    }
}

void RkBasicPropertyWgt::finishPropertyEdit()
{
    for (const QPointer<RkProperty>& property : qAsConst(d->editing)) {
        if (property)
            property->finishEdit();
    }
    d->editing.clear();
    if (d->hold)
        d->hold->accept(undoCaption());
    d->hold.reset();
}

void RkBasicPropertyWgt::cancelPropertyEdit()
{
    for (const QPointer<RkProperty>& property : qAsConst(d->editing)) {
        if (property)
            property->cancelEdit();
    }
    d->editing.clear();
    if (d->hold)
        d->hold->cancel();
    d->hold.reset();
}

bool RkBasicPropertyWgt::isPropertyEditOpen() const
{
    return d->hold != nullptr;
}

QString RkBasicPropertyWgt::undoCaption() const
{
    const RkProperty* first = getFirstProperty();
    const QString label = first ? first->getLabel() : QString();
    return label.isEmpty() ? tr("Unnamed") : label;
}

void RkBasicPropertyWgt::attachSlider(RkSlider* slider)
{
    d->slider = slider;
    layout()->addWidget(slider);
    connect(slider, &RkSlider::editStart, this, &RkBasicPropertyWgt::beginPropertyEdit);
    connect(slider, &RkSlider::editEnd, this, &RkBasicPropertyWgt::finishPropertyEdit);
    connect(slider, &RkSlider::editCancelled, this, &RkBasicPropertyWgt::cancelPropertyEdit);
    slider->setSelected(isSelected());
    updateSliderBar();
}

void RkBasicPropertyWgt::setSliderBarOnHover(bool on)
{
    d->barOnHover = on;
    updateSliderBar();
}

bool RkBasicPropertyWgt::isSliderBarOnHover() const
{
    return d->barOnHover;
}

void RkBasicPropertyWgt::enterEvent(QEvent* event)
{
    d->hovered = true;
    updateSliderBar();
    RkPropertyWgt::enterEvent(event);
}

void RkBasicPropertyWgt::leaveEvent(QEvent* event)
{
    d->hovered = false;
    updateSliderBar();
    RkPropertyWgt::leaveEvent(event);
}

void RkBasicPropertyWgt::updateSliderBar()
{
    if (d->slider)
        d->slider->setBarVisible(!d->barOnHover || d->hovered);
}
