#pragma once

#include "widgets/rkbasicpropertywgt.h"

// Edits integer properties with a slider.
class RKCORE_EXPORT RkIntPropertyWgt : public RkBasicPropertyWgt
{
    Q_OBJECT
public:
    explicit RkIntPropertyWgt(QWidget* parent = nullptr, const QString& name = QString());
    ~RkIntPropertyWgt() override;

    // Takes integer properties only.
    void addProperty(RkProperty* property) override;

    // When on, the bar shows only while the pointer is over the widget; label and value always.
    void setIsMouseOverSlider(bool on);
    bool isMouseOverSlider() const;

protected:
    void updateFromProperties() override;

private:
    void sliderValueChanged(int value);

    struct Private;
    std::unique_ptr<Private> d;
};
