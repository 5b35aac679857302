#include "properties/rkboolproperty.h"

#include "io/rkinfile.h"
#include "io/rkoutfile.h"

RkBoolProperty::RkBoolProperty(const QString& name, const QString& label, QObject* parent)
    : RkProperty(name, label, parent)
{
}

RkBoolProperty::~RkBoolProperty() = default;

bool RkBoolProperty::getValue() const
{
    return m_value;
}

bool RkBoolProperty::setValue(bool value)
{
    return !isLocked() && storeValue(value);
}

bool RkBoolProperty::storeValue(bool value)
{
    if (value == m_value)
        return true;
    const bool old = m_value;
    m_value = value;
    valueChanged(QVariant(old));
    return true;
}

bool RkBoolProperty::getDefaultValue() const
{
    return m_default;
}

void RkBoolProperty::setDefaultValue(bool value)
{
    m_default = value;
}

QString RkBoolProperty::widgetClassName() const
{
    return QStringLiteral("RkBoolPropertyWgt");
}

QVariant RkBoolProperty::getValueVariant() const
{
    return QVariant(m_value);
}

bool RkBoolProperty::setValueVariant(const QVariant& value)
{
    if (value.type() != QVariant::Bool)
        return false;
    return storeValue(value.toBool());
}

void RkBoolProperty::saveState(RkOutFile* file) const
{
    file->writeBool(m_value);
    file->writeBool(m_default);
}

void RkBoolProperty::loadState(RkInFile* file)
{
    bool value = false, def = false;
    if (!file->readBool(value) || !file->readBool(def))
        return;
    setDefaultValue(def);
    storeValue(value);
}
