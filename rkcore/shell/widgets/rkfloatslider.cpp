#include "widgets/rkfloatslider.h"

#include <cmath>

struct RkFloatSlider::Private {
    bool percent = false;
};

RkFloatSlider::RkFloatSlider(QWidget* parent, const QString& text)
    : RkSlider(parent, text), d(std::make_unique<Private>())
{
}

RkFloatSlider::~RkFloatSlider() = default;

float RkFloatSlider::getValue() const
{
    return float(sliderValue());
}

void RkFloatSlider::setValue(float value)
{
    setSliderValue(value);
}

float RkFloatSlider::getMin() const
{
    return float(sliderMin());
}

float RkFloatSlider::getMax() const
{
    return float(sliderMax());
}

void RkFloatSlider::setMinMax(float min, float max)
{
    setSliderMinMax(min, max);
}

float RkFloatSlider::getDefaultValue() const
{
    return float(sliderDefaultValue());
}

void RkFloatSlider::setDefaultValue(float value)
{
    setSliderDefaultValue(value);
}

bool RkFloatSlider::getDisplayAsPercent() const
{
    return d->percent;
}

void RkFloatSlider::setDisplayAsPercent(bool on)
{
    if (on == d->percent)
        return;
    d->percent = on;
    updateRect();
}

double RkFloatSlider::roundValue(double value) const
{
    return double(float(value));
}

QString RkFloatSlider::formatValue(double value) const
{
    // One decimal more than a fine (Shift) step of the default sensitivity needs.
    if (d->percent)
        return QString::number(value * 100.0, 'f', 1) + QLatin1Char('%');
    return QString::number(value, 'f', 3);
}

bool RkFloatSlider::parseValue(const QString& text, double* value) const
{
    QString t = text.trimmed();
    // "50%" means a half whatever the display; plain numbers follow the display.
    bool percent = d->percent;
    if (t.endsWith(QLatin1Char('%'))) {
        t.chop(1);
        percent = true;
    }
    bool ok = false;
    double v = t.trimmed().toDouble(&ok);
    if (percent)
        v /= 100.0;
    if (!ok || !std::isfinite(v) || !std::isfinite(float(v)))
        return false;
    *value = v;
    return true;
}

void RkFloatSlider::sliderValueChanged()
{
    Q_EMIT valueChanged(getValue());
}

QString RkFloatSlider::widestValueText() const
{
    return d->percent ? QStringLiteral("-000.0%") : QStringLiteral("-0000.000");
}
