#include "scene/rkcamera.h"

#include "properties/rkfloatproperty.h"

#include <QPointer>

RkCamera::RkCamera(QObject* parent) : RkNode(parent)
{
    auto* fov = new RkFloatProperty(QStringLiteral("FieldOfView"), QStringLiteral("Field of View"));
    fov->setMinMax(1, 170);
    fov->setClamped(true);
    fov->setDefaultValue(35);
    fov->setValue(35);
    fov->setSensitivity(0.5f);
    addProperty(fov, QStringLiteral("Camera"));
}

RkCamera::~RkCamera() = default;

RkFloatProperty* RkCamera::getFieldOfView() const
{
    return qobject_cast<RkFloatProperty*>(findProperty(QStringLiteral("FieldOfView")));
}

QVector3D RkCamera::getPosition() const
{
    return QVector3D(getXTranslate()->getValue(), getYTranslate()->getValue(),
                     getZTranslate()->getValue());
}

void RkCamera::setPosition(const QVector3D& position)
{
    getXTranslate()->setValue(position.x());
    getYTranslate()->setValue(position.y());
    getZTranslate()->setValue(position.z());
}
