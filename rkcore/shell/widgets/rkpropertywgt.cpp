#include "widgets/rkpropertywgt.h"

#include "properties/rkproperty.h"

#include <QMouseEvent>
#include <QPainter>
#include <QPointer>

struct RkPropertyWgt::Private {
    QList<QPointer<RkProperty>> properties;
    bool selected = false;
    bool writing = false; // updates wait until every property is written
};

RkPropertyWgt::RkPropertyWgt(QWidget* parent) : QWidget(parent), d(std::make_unique<Private>()) {}

RkPropertyWgt::~RkPropertyWgt() = default;

void RkPropertyWgt::addProperty(RkProperty* property)
{
    if (!property || d->properties.contains(property))
        return;
    d->properties.append(property);
    // Two connections per property: a pooled widget is given other properties all the time.
    connect(property, &QObject::destroyed, this, &RkPropertyWgt::dropDestroyedProperties);
    connect(property, &RkProperty::changed, this, &RkPropertyWgt::propertyChanged);
    updateFromProperties();
}

void RkPropertyWgt::removeAllProperties()
{
    for (const QPointer<RkProperty>& property : qAsConst(d->properties)) {
        if (property)
            disconnect(property, nullptr, this, nullptr);
    }
    // No update: the widget is emptied to be filled again (a pool does both at once) or hidden.
    d->properties.clear();
}

void RkPropertyWgt::setSelected(bool selected)
{
    if (selected == d->selected)
        return;
    d->selected = selected;
    update();
}

bool RkPropertyWgt::isSelected() const
{
    return d->selected;
}

RkProperty* RkPropertyWgt::getFirstProperty() const
{
    for (const QPointer<RkProperty>& property : qAsConst(d->properties)) {
        if (property)
            return property;
    }
    return nullptr;
}

QList<RkProperty*> RkPropertyWgt::getProperties() const
{
    QList<RkProperty*> properties;
    for (const QPointer<RkProperty>& property : qAsConst(d->properties)) {
        if (property)
            properties.append(property);
    }
    return properties;
}

void RkPropertyWgt::mousePressEvent(QMouseEvent* event)
{
    // Other presses stop here: the widget, not what lies under it, was clicked.
    event->setAccepted(event->button() != Qt::RightButton);
}

void RkPropertyWgt::paintEvent(QPaintEvent*)
{
    if (!d->selected)
        return;
    QPainter p(this);
    const QPalette::ColorGroup group = !isEnabled()       ? QPalette::Disabled
                                       : isActiveWindow() ? QPalette::Active
                                                          : QPalette::Inactive;
    p.fillRect(rect(), palette().color(group, QPalette::Highlight));
}

void RkPropertyWgt::updateFromProperties() {}

bool RkPropertyWgt::isPropertyEditable(const RkProperty* property) const
{
    return property && !property->isLocked();
}

bool RkPropertyWgt::arePropertiesEditable() const
{
    const QList<RkProperty*> properties = getProperties();
    if (properties.isEmpty())
        return false;
    for (const RkProperty* property : properties) {
        if (!isPropertyEditable(property))
            return false;
    }
    return true;
}

bool RkPropertyWgt::arePropertiesMixed() const
{
    const QList<RkProperty*> properties = getProperties();
    for (const RkProperty* property : properties) {
        if (property->getValueVariant() != properties.first()->getValueVariant())
            return true;
    }
    return false;
}

void RkPropertyWgt::writeProperties(const std::function<void(RkProperty*)>& write)
{
    d->writing = true;
    for (RkProperty* property : getProperties())
        write(property);
    d->writing = false;
    updateFromProperties();
}

void RkPropertyWgt::propertyChanged()
{
    if (!d->writing)
        updateFromProperties();
}

void RkPropertyWgt::dropDestroyedProperties()
{
    // The destroyed property's pointer is already null here.
    d->properties.removeAll(QPointer<RkProperty>());
    updateFromProperties();
}
