#pragma once

#include "io/rkbase.h"

#include <QImage>
#include <QPoint>

#include <memory>

class RkEzMixer;
class RkFloatProperty;

// One morph taking part in a mixer: the property it drives, the property's value at full
// weight, its thumbnail and its point on the mixer field.
class RkEzMixerControl : public RkBase
{
    Q_OBJECT
public:
    RkEzMixerControl();
    ~RkEzMixerControl() override;

    // The mixer the control was added to, or null.
    RkEzMixer* getMixer() const;
    void setMixer(RkEzMixer* mixer);

    // Null once the property has been deleted. Setting a property resets the value to 1.
    RkFloatProperty* getControlProperty() const;
    void setControlProperty(RkFloatProperty* property);
    float getValue() const;
    void setValue(float value);

    QImage getImage() const;
    void setImage(const QImage& image);

    int getX() const;
    int getY() const;
    void setX(int x);
    void setY(int y);
    QPoint getPoint() const;

    void loadSection(RkInFile* file, short sectionId) override;
    void postLoadFile(RkInFile* file) override;
    void setPointer(const RkInFile* file, short sectionId, short index, RkBase* object) override;
    void save(RkOutFile* file) const override;

private:
    struct Private;
    std::unique_ptr<Private> d;
};
