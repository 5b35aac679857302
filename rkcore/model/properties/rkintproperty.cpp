#include "properties/rkintproperty.h"

#include "io/rkinfile.h"
#include "io/rkoutfile.h"

RkIntProperty::RkIntProperty(const QString& name, const QString& label, QObject* parent)
    : RkNumericProperty(name, label, parent)
{
}

RkIntProperty::RkIntProperty(const QString& name, bool clamped, bool hidden, int value,
                             QObject* parent)
    : RkNumericProperty(name, name, parent), m_value(value)
{
    setClamped(clamped);
    setHidden(hidden);
}

RkIntProperty::~RkIntProperty() = default;

int RkIntProperty::getValue() const
{
    return m_value;
}

bool RkIntProperty::setValue(int value)
{
    return !isLocked() && storeValue(value);
}

bool RkIntProperty::storeValue(int value)
{
    if (value == m_value)
        return true;
    const int old = m_value;
    m_value = value;
    valueChanged(QVariant(old));
    return true;
}

bool RkIntProperty::adjustValue(int value)
{
    return setValue(isClamped() ? qBound(m_min, value, m_max) : value);
}

int RkIntProperty::getMemorizedValue() const
{
    return m_hasMemorized ? m_memorized : m_default;
}

void RkIntProperty::setMemorizedValue(int value)
{
    m_memorized = value;
    m_hasMemorized = true;
}

int RkIntProperty::getDefaultValue() const
{
    return m_default;
}

void RkIntProperty::setDefaultValue(int value)
{
    m_default = value;
}

int RkIntProperty::getMin() const
{
    return m_min;
}

int RkIntProperty::getMax() const
{
    return m_max;
}

void RkIntProperty::setMinMax(int min, int max)
{
    if (min > max || (min == m_min && max == m_max))
        return;
    m_min = min;
    m_max = max;
    Q_EMIT minMaxChanged();
    Q_EMIT changed();
}

QString RkIntProperty::widgetClassName() const
{
    return QStringLiteral("RkIntPropertyWgt");
}

QVariant RkIntProperty::getValueVariant() const
{
    return QVariant(m_value);
}

bool RkIntProperty::setValueVariant(const QVariant& value)
{
    bool ok = false;
    const int v = value.toInt(&ok);
    return ok && storeValue(v);
}

void RkIntProperty::saveState(RkOutFile* file) const
{
    file->writeInt(m_value);
    file->writeInt(m_default);
    file->writeInt(m_min);
    file->writeInt(m_max);
    file->writeBool(isClamped());
    file->writeInt(getMemorizedValue());
}

void RkIntProperty::loadState(RkInFile* file)
{
    int value = 0, def = 0, min = 0, max = 0;
    bool clamped = false;
    if (!file->readInt(value) || !file->readInt(def) || !file->readInt(min) ||
        !file->readInt(max) || !file->readBool(clamped))
        return;
    if (min > max) {
        file->setError(
            QStringLiteral("property \"%1\" has a minimum above its maximum").arg(getName()));
        return;
    }
    setMinMax(min, max);
    setDefaultValue(def);
    setClamped(clamped);
    storeValue(value);
    // Files from before memorized values end here.
    int memorized = 0;
    if (!file->atSectionEnd() && file->readInt(memorized))
        setMemorizedValue(memorized);
}
