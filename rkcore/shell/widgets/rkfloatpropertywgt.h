#pragma once

#include "widgets/rkbasicpropertywgt.h"

// Edits float properties with a slider. Its options dialog edits the label, limits, clamping,
// sensitivity, percent display and hiding of all its properties at once.
class RKCORE_EXPORT RkFloatPropertyWgt : public RkBasicPropertyWgt
{
    Q_OBJECT
public:
    explicit RkFloatPropertyWgt(QWidget* parent = nullptr, const QString& name = QString());
    ~RkFloatPropertyWgt() override;

    // Takes float properties only.
    void addProperty(RkProperty* property) override;
    bool doOptionsDialog() override;

    // When on, the bar shows only while the pointer is over the widget; label and value always.
    void setIsMouseOverSlider(bool on);
    bool isMouseOverSlider() const;

protected:
    void updateFromProperties() override;

private:
    void sliderValueChanged(float value);

    struct Private;
    std::unique_ptr<Private> d;
};
