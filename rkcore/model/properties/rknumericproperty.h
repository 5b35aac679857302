#pragma once

#include "properties/rkproperty.h"

// A property with a number as value; a clamped one keeps adjusted values within its limits.
class RKCORE_EXPORT RkNumericProperty : public RkProperty
{
    Q_OBJECT
public:
    RkNumericProperty(const QString& name, const QString& label, QObject* parent = nullptr);
    ~RkNumericProperty() override;

    bool isClamped() const;
    void setClamped(bool clamped);

Q_SIGNALS:
    void clampedChanged(bool clamped);
    void minMaxChanged();

private:
    bool m_clamped = false;
};
