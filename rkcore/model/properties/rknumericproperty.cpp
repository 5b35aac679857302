#include "properties/rknumericproperty.h"

RkNumericProperty::RkNumericProperty(const QString& name, const QString& label, QObject* parent)
    : RkProperty(name, label, parent)
{
}

RkNumericProperty::~RkNumericProperty() = default;

bool RkNumericProperty::isClamped() const
{
    return m_clamped;
}

void RkNumericProperty::setClamped(bool clamped)
{
    if (clamped == m_clamped)
        return;
    m_clamped = clamped;
    Q_EMIT clampedChanged(clamped);
    Q_EMIT changed();
}
