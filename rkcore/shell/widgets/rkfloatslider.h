#pragma once

#include "widgets/rkslider.h"

// A slider over a float value. With display as percent the value 0.5 shows as "50.0%", and typed
// text is read in percent too.
class RKCORE_EXPORT RkFloatSlider : public RkSlider
{
    Q_OBJECT
public:
    explicit RkFloatSlider(QWidget* parent = nullptr, const QString& text = QString());
    ~RkFloatSlider() override;

    float getValue() const;
    float getMin() const;
    float getMax() const;
    // Ignored unless both are finite and min <= max.
    void setMinMax(float min, float max);
    // Where Home takes the value.
    float getDefaultValue() const;
    void setDefaultValue(float value);
    bool getDisplayAsPercent() const;
    void setDisplayAsPercent(bool on);

public Q_SLOTS:
    // A value that is not finite is refused.
    void setValue(float value);

Q_SIGNALS:
    void valueChanged(float value);

protected:
    double roundValue(double value) const override;
    QString formatValue(double value) const override;
    bool parseValue(const QString& text, double* value) const override;
    void sliderValueChanged() override;
    QString widestValueText() const override;

private:
    struct Private;
    std::unique_ptr<Private> d;
};
