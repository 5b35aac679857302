#pragma once

#include "widgets/rkslider.h"

// A slider over an integer value. A drag adds up fractions of a step until they make a whole one;
// a key steps by the sensitivity rounded, at least by one.
class RKCORE_EXPORT RkIntSlider : public RkSlider
{
    Q_OBJECT
public:
    explicit RkIntSlider(QWidget* parent = nullptr, const QString& text = QString());
    ~RkIntSlider() override;

    int getValue() const;
    int getMin() const;
    int getMax() const;
    // Ignored unless min <= max.
    void setMinMax(int min, int max);
    int getDefaultValue() const;
    void setDefaultValue(int value);

public Q_SLOTS:
    void setValue(int value);

Q_SIGNALS:
    void valueChanged(int value);

protected:
    double roundValue(double value) const override;
    QString formatValue(double value) const override;
    bool parseValue(const QString& text, double* value) const override;
    void sliderValueChanged() override;
    QString widestValueText() const override;
    double minimumStep() const override;
};
