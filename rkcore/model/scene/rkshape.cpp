#include "scene/rkshape.h"

#include "scene/rkmaterial.h"

struct RkShape::Private {
    // Slots stay in place when a material goes, so the indices of the others keep their meaning.
    QList<RkMaterial*> materials;
};

RkShape::RkShape(const QString& name, QObject* parent)
    : RkElement(parent, name), d(std::make_unique<Private>())
{
}

RkShape::~RkShape()
{
    for (RkMaterial* m : d->materials) {
        if (m)
            m->removeShape(this);
    }
    // Owned materials are deleted with the Qt children; they no longer list this shape.
    d->materials.clear();
}

int RkShape::getNumMaterials() const
{
    return d->materials.size();
}

RkMaterial* RkShape::getMaterial(int index) const
{
    return d->materials.value(index, nullptr);
}

int RkShape::findMaterialIndex(const RkMaterial* material) const
{
    if (!material)
        return -1;
    return d->materials.indexOf(const_cast<RkMaterial*>(material));
}

int RkShape::addMaterial(RkMaterial* material)
{
    if (!material)
        return -1;
    const int existing = d->materials.indexOf(material);
    if (existing >= 0)
        return existing;
    if (!material->parent())
        material->setParent(this);
    d->materials.append(material);
    material->addShape(this);
    return d->materials.size() - 1;
}

void RkShape::forgetMaterial(RkMaterial* material)
{
    for (RkMaterial*& m : d->materials) {
        if (m == material)
            m = nullptr;
    }
}
