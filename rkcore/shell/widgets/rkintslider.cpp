#include "widgets/rkintslider.h"

#include <cmath>
#include <limits>

RkIntSlider::RkIntSlider(QWidget* parent, const QString& text) : RkSlider(parent, text)
{
    setSensitivity(0.1f);
    setSliderMinMax(0, 100);
}

RkIntSlider::~RkIntSlider() = default;

int RkIntSlider::getValue() const
{
    return int(sliderValue());
}

void RkIntSlider::setValue(int value)
{
    setSliderValue(value);
}

int RkIntSlider::getMin() const
{
    return int(sliderMin());
}

int RkIntSlider::getMax() const
{
    return int(sliderMax());
}

void RkIntSlider::setMinMax(int min, int max)
{
    setSliderMinMax(min, max);
}

int RkIntSlider::getDefaultValue() const
{
    return int(sliderDefaultValue());
}

void RkIntSlider::setDefaultValue(int value)
{
    setSliderDefaultValue(value);
}

double RkIntSlider::roundValue(double value) const
{
    return qBound(double(std::numeric_limits<int>::min()), std::round(value),
                  double(std::numeric_limits<int>::max()));
}

QString RkIntSlider::formatValue(double value) const
{
    return QString::number(qint64(value));
}

bool RkIntSlider::parseValue(const QString& text, double* value) const
{
    bool ok = false;
    const double v = text.trimmed().toDouble(&ok);
    if (!ok || !std::isfinite(v) || std::abs(v) > std::numeric_limits<int>::max())
        return false;
    *value = v;
    return true;
}

void RkIntSlider::sliderValueChanged()
{
    Q_EMIT valueChanged(getValue());
}

QString RkIntSlider::widestValueText() const
{
    return QStringLiteral("-0000000");
}

double RkIntSlider::minimumStep() const
{
    return 1.0;
}
