#pragma once

#include "scene/rknode.h"

#include <QColor>

// A distant light shining along its local -Z axis.
class RKCORE_EXPORT RkLight : public RkNode
{
    Q_OBJECT
public:
    explicit RkLight(QObject* parent = nullptr);
    ~RkLight() override;

    RkFloatProperty* getIntensity() const;
    QColor getColor() const;
    void setColor(const QColor& color);
    // Unit vector the light travels along, in world coordinates.
    QVector3D getDirection() const;
};
