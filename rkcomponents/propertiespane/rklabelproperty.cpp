#include "rklabelproperty.h"

RkLabelProperty::RkLabelProperty(const QString& name) : RkIntProperty(name, false, false, 0) {}

RkLabelProperty::~RkLabelProperty() = default;

QString RkLabelProperty::widgetClassName() const
{
    return QStringLiteral("RkLabelPropertyWgt");
}
