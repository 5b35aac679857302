#pragma once

#include "scene/rkelement.h"

#include <memory>

class RkMaterial;

// A shape of an object: the list of materials its facets name by index (the facet's material
// index is the position in this list). Its element parent is the object.
class RKCORE_EXPORT RkShape : public RkElement
{
    Q_OBJECT
public:
    explicit RkShape(const QString& name = QString(), QObject* parent = nullptr);
    ~RkShape() override;

    int getNumMaterials() const;
    // Null for an index out of range or a material that has been deleted.
    RkMaterial* getMaterial(int index) const;
    // -1 when the shape does not use the material.
    int findMaterialIndex(const RkMaterial* material) const;
    // Appends the material and returns its index. A material with no Qt parent becomes the
    // shape's; one the shape already lists keeps its index.
    int addMaterial(RkMaterial* material);

private:
    friend class RkMaterial;
    void forgetMaterial(RkMaterial* material);

    struct Private;
    std::unique_ptr<Private> d;
};
