#pragma once

#include "properties/rknumericproperty.h"

// An integer property; adjustValue() clamps to [min, max] when the property is clamped.
class RKCORE_EXPORT RkIntProperty : public RkNumericProperty
{
    Q_OBJECT
public:
    RkIntProperty(const QString& name, const QString& label, QObject* parent = nullptr);
    // A property labelled with its name, with clamping, hidden state and value given.
    RkIntProperty(const QString& name, bool clamped, bool hidden, int value,
                  QObject* parent = nullptr);
    ~RkIntProperty() override;

    int getValue() const;
    bool setValue(int value);
    bool adjustValue(int value);
    // The value that "Restore" goes back to: the default until something is memorized.
    int getMemorizedValue() const;
    void setMemorizedValue(int value);
    int getDefaultValue() const;
    void setDefaultValue(int value);
    int getMin() const;
    int getMax() const;
    void setMinMax(int min, int max);

    QString widgetClassName() const override;
    QVariant getValueVariant() const override;
    bool setValueVariant(const QVariant& value) override;
    void saveState(RkOutFile* file) const override;
    void loadState(RkInFile* file) override;

private:
    bool storeValue(int value);

    int m_value = 0;
    int m_memorized = 0;
    bool m_hasMemorized = false;
    int m_default = 0;
    int m_min = -1000000;
    int m_max = 1000000;
};
