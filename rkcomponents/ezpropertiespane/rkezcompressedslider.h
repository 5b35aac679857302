#pragma once

#include "widgets/rkfloatslider.h"

// The one-line slider of a property list row: the label on the left, the bar after it and the
// value text at the right end, all in a row of the style's compressed slider height.
class RkEzCompressedSlider : public RkFloatSlider
{
    Q_OBJECT
public:
    RkEzCompressedSlider(QWidget* parent, const QString& text);
    ~RkEzCompressedSlider() override;

    QSize calcMinSize() override;
    QRect calcSliderRect() override;
    QRect calcTextRect() override;
    QRect calcEditRect() override;
    QRect calcLabelRect() override;

public Q_SLOTS:
    void setLabel(const QString& label) override;

private:
    // The widest value text, so the value column keeps its width whatever the value.
    int valueWidth();
};
