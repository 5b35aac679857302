#include "properties/rkfloatproperty.h"

#include "io/rkinfile.h"
#include "io/rkoutfile.h"

#include <cmath>

RkFloatProperty::RkFloatProperty(const QString& name, const QString& label, QObject* parent)
    : RkNumericProperty(name, label, parent)
{
}

RkFloatProperty::~RkFloatProperty() = default;

float RkFloatProperty::getValue() const
{
    return m_value;
}

bool RkFloatProperty::setValue(float value)
{
    return !isLocked() && storeValue(value);
}

bool RkFloatProperty::storeValue(float value)
{
    if (!std::isfinite(value)) {
        logRefusedValue(QString::number(double(value)));
        return false;
    }
    if (value == m_value)
        return true;
    const float old = m_value;
    m_value = value;
    valueChanged(QVariant(old));
    return true;
}

bool RkFloatProperty::adjustValue(float value)
{
    if (std::isfinite(value) && isClamped())
        value = qBound(m_min, value, m_max);
    return setValue(value);
}

float RkFloatProperty::getMemorizedValue() const
{
    return m_hasMemorized ? m_memorized : m_default;
}

void RkFloatProperty::setMemorizedValue(float value)
{
    if (!std::isfinite(value))
        return;
    m_memorized = value;
    m_hasMemorized = true;
}

float RkFloatProperty::getDefaultValue() const
{
    return m_default;
}

void RkFloatProperty::setDefaultValue(float value)
{
    if (std::isfinite(value))
        m_default = value;
}

float RkFloatProperty::getMin() const
{
    return m_min;
}

float RkFloatProperty::getMax() const
{
    return m_max;
}

void RkFloatProperty::setMinMax(float min, float max)
{
    if (!std::isfinite(min) || !std::isfinite(max) || min > max)
        return;
    if (min == m_min && max == m_max)
        return;
    m_min = min;
    m_max = max;
    Q_EMIT minMaxChanged();
    Q_EMIT changed();
}

float RkFloatProperty::getSensitivity() const
{
    return m_sensitivity;
}

void RkFloatProperty::setSensitivity(float sensitivity)
{
    if (std::isfinite(sensitivity) && sensitivity > 0)
        m_sensitivity = sensitivity;
}

bool RkFloatProperty::getDisplayAsPercent() const
{
    return m_percent;
}

void RkFloatProperty::setDisplayAsPercent(bool on)
{
    if (on == m_percent)
        return;
    m_percent = on;
    Q_EMIT displayAsPercentChanged();
    Q_EMIT changed();
}

QString RkFloatProperty::widgetClassName() const
{
    return QStringLiteral("RkFloatPropertyWgt");
}

QVariant RkFloatProperty::getValueVariant() const
{
    return QVariant(m_value);
}

bool RkFloatProperty::setValueVariant(const QVariant& value)
{
    bool ok = false;
    const float v = value.toFloat(&ok);
    return ok && storeValue(v);
}

void RkFloatProperty::saveState(RkOutFile* file) const
{
    file->writeFloat(m_value);
    file->writeFloat(m_default);
    file->writeFloat(m_min);
    file->writeFloat(m_max);
    file->writeFloat(m_sensitivity);
    file->writeBool(isClamped());
    file->writeBool(m_percent);
    file->writeFloat(getMemorizedValue());
}

void RkFloatProperty::loadState(RkInFile* file)
{
    float value = 0, def = 0, min = 0, max = 0, sensitivity = 0;
    bool clamped = false, percent = false;
    if (!file->readFloat(value) || !file->readFloat(def) || !file->readFloat(min) ||
        !file->readFloat(max) || !file->readFloat(sensitivity) || !file->readBool(clamped) ||
        !file->readBool(percent))
        return;
    if (min > max) {
        file->setError(
            QStringLiteral("property \"%1\" has a minimum above its maximum").arg(getName()));
        return;
    }
    setMinMax(min, max);
    setDefaultValue(def);
    setSensitivity(sensitivity);
    setClamped(clamped);
    setDisplayAsPercent(percent);
    storeValue(value);
    // Files from before memorized values end here.
    float memorized = 0;
    if (!file->atSectionEnd() && file->readFloat(memorized))
        setMemorizedValue(memorized);
}
