#pragma once

#include "properties/rkintproperty.h"

// A property that only shows its label: the placeholder lines of the favourites groups.
class RkLabelProperty : public RkIntProperty
{
    Q_OBJECT
public:
    explicit RkLabelProperty(const QString& name);
    ~RkLabelProperty() override;

    QString widgetClassName() const override;
};
