#include "scene/rklight.h"

#include "properties/rkfloatproperty.h"

static RkFloatProperty* addChannel(RkLight* light, const QString& name, float value)
{
    auto* p = new RkFloatProperty(name, name);
    p->setMinMax(0, 1);
    p->setClamped(true);
    p->setDefaultValue(value);
    p->setValue(value);
    light->addProperty(p, QStringLiteral("Light/Color"));
    return p;
}

RkLight::RkLight(QObject* parent) : RkNode(parent)
{
    auto* intensity = new RkFloatProperty(QStringLiteral("Intensity"), QStringLiteral("Intensity"));
    intensity->setMinMax(0, 10);
    intensity->setClamped(true);
    intensity->setDefaultValue(1);
    intensity->setValue(1);
    intensity->setDisplayAsPercent(true);
    addProperty(intensity, QStringLiteral("Light"));
    addChannel(this, QStringLiteral("Red"), 1);
    addChannel(this, QStringLiteral("Green"), 1);
    addChannel(this, QStringLiteral("Blue"), 1);
}

RkLight::~RkLight() = default;

RkFloatProperty* RkLight::getIntensity() const
{
    return qobject_cast<RkFloatProperty*>(findProperty(QStringLiteral("Intensity")));
}

static float channel(const RkLight* light, const char* name)
{
    auto* p = qobject_cast<RkFloatProperty*>(light->findProperty(QLatin1String(name)));
    return p ? p->getValue() : 1.0f;
}

QColor RkLight::getColor() const
{
    return QColor::fromRgbF(channel(this, "Red"), channel(this, "Green"), channel(this, "Blue"));
}

void RkLight::setColor(const QColor& color)
{
    const qreal rgb[3] = {color.redF(), color.greenF(), color.blueF()};
    const char* names[3] = {"Red", "Green", "Blue"};
    for (int i = 0; i < 3; ++i) {
        if (auto* p = qobject_cast<RkFloatProperty*>(findProperty(QLatin1String(names[i]))))
            p->setValue(float(rgb[i]));
    }
}

QVector3D RkLight::getDirection() const
{
    return getWorldTransform().mapVector(QVector3D(0, 0, -1)).normalized();
}
