#pragma once

#include "scene/rknode.h"

// A camera. It looks down its local -Z axis from its translation; "Field of View" is the
// vertical opening angle in degrees.
class RKCORE_EXPORT RkCamera : public RkNode
{
    Q_OBJECT
public:
    explicit RkCamera(QObject* parent = nullptr);
    ~RkCamera() override;

    RkFloatProperty* getFieldOfView() const;
    QVector3D getPosition() const;
    void setPosition(const QVector3D& position);
};
