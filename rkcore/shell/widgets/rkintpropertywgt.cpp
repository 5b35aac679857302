#include "widgets/rkintpropertywgt.h"

#include "properties/rkintproperty.h"
#include "widgets/rkintslider.h"

#include <QSignalBlocker>

struct RkIntPropertyWgt::Private {
    RkIntSlider* slider = nullptr;
};

RkIntPropertyWgt::RkIntPropertyWgt(QWidget* parent, const QString& name)
    : RkBasicPropertyWgt(parent, name), d(std::make_unique<Private>())
{
    d->slider = new RkIntSlider(this, QStringLiteral("IntPropertySlider"));
    attachSlider(d->slider);
    connect(d->slider, &RkIntSlider::valueChanged, this, &RkIntPropertyWgt::sliderValueChanged);
    updateFromProperties();
}

RkIntPropertyWgt::~RkIntPropertyWgt() = default;

void RkIntPropertyWgt::addProperty(RkProperty* property)
{
    // Limits and clamping reach the widget through RkProperty::changed().
    if (qobject_cast<RkIntProperty*>(property))
        RkBasicPropertyWgt::addProperty(property);
}

void RkIntPropertyWgt::setIsMouseOverSlider(bool on)
{
    setSliderBarOnHover(on);
}

bool RkIntPropertyWgt::isMouseOverSlider() const
{
    return isSliderBarOnHover();
}

void RkIntPropertyWgt::updateFromProperties()
{
    if (const auto* first = static_cast<const RkIntProperty*>(getFirstProperty())) {
        const QSignalBlocker blocker(d->slider);
        d->slider->setClamped(first->isClamped());
        d->slider->setMinMax(first->getMin(), first->getMax());
        d->slider->setDefaultValue(first->getDefaultValue());
        d->slider->setValue(first->getValue());
    }
    RkBasicPropertyWgt::updateFromProperties();
}

void RkIntPropertyWgt::sliderValueChanged(int value)
{
    if (!isPropertyEditOpen())
        return;
    writeProperties([value](RkProperty* property) {
        static_cast<RkIntProperty*>(property)->adjustValue(value);
    });
}
