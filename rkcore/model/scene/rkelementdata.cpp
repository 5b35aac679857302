#include "scene/rkelementdata.h"

#include "scene/rkelement.h"

RkElementData::RkElementData(const QString& name, bool persistent) : RkBase(nullptr, name)
{
    if (persistent)
        makePersistent();
}

RkElementData::~RkElementData() = default;

RkElement* RkElementData::getElement() const
{
    return qobject_cast<RkElement*>(parent());
}
