#pragma once

#include "io/rkbase.h"

class RkElement;

// Named data attached to a scene element (RkElement::addDataItem). The element owns it; a
// persistent item is stored with the scene and comes back with its element.
class RKCORE_EXPORT RkElementData : public RkBase
{
    Q_OBJECT
public:
    explicit RkElementData(const QString& name = QString(), bool persistent = true);
    ~RkElementData() override;

    // The element the item is attached to, or null.
    RkElement* getElement() const;
};
