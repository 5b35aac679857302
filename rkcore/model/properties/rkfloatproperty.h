#pragma once

#include "properties/rknumericproperty.h"

// A float property. setValue() stores any finite value as given; adjustValue() clamps it to
// [min, max] first when the property is clamped. A value that is not a finite number is
// refused: the property keeps its value and the refusal is logged.
class RKCORE_EXPORT RkFloatProperty : public RkNumericProperty
{
    Q_OBJECT
public:
    RkFloatProperty(const QString& name, const QString& label, QObject* parent = nullptr);
    ~RkFloatProperty() override;

    float getValue() const;
    // False when the value was refused.
    bool setValue(float value);
    bool adjustValue(float value);

    // The value that "Restore" goes back to: the default until something is memorized.
    float getMemorizedValue() const;
    void setMemorizedValue(float value);
    float getDefaultValue() const;
    void setDefaultValue(float value);
    float getMin() const;
    float getMax() const;
    void setMinMax(float min, float max);
    float getSensitivity() const;
    void setSensitivity(float sensitivity);
    bool getDisplayAsPercent() const;
    void setDisplayAsPercent(bool on);

    QString widgetClassName() const override;
    QVariant getValueVariant() const override;
    bool setValueVariant(const QVariant& value) override;
    void saveState(RkOutFile* file) const override;
    void loadState(RkInFile* file) override;

Q_SIGNALS:
    void displayAsPercentChanged();

private:
    bool storeValue(float value);

    float m_value = 0.0f;
    float m_memorized = 0.0f;
    bool m_hasMemorized = false;
    float m_default = 0.0f;
    float m_min = -10000.0f;
    float m_max = 10000.0f;
    float m_sensitivity = 0.01f;
    bool m_percent = false;
};
