#include "scene/rkmaterial.h"

#include "scene/rkscene.h"
#include "scene/rkshape.h"

namespace
{

QList<RkMaterial*>& allMaterials()
{
    static QList<RkMaterial*> materials;
    return materials;
}

void announceSelection()
{
    if (rkScene)
        Q_EMIT rkScene->materialSelectionChanged();
}

} // namespace

struct RkMaterial::Private {
    bool selected = false;
    QColor diffuse = QColor(200, 200, 200);
    QImage texture;
    QString textureName;
    QList<RkShape*> shapes;
};

RkMaterial::RkMaterial(const QString& name, QObject* parent)
    : RkElement(parent, name), d(std::make_unique<Private>())
{
    setLabel(name);
    allMaterials().append(this);
}

RkMaterial::~RkMaterial()
{
    allMaterials().removeAll(this);
    // Shapes still using the material forget it; they must not point at a dead object.
    const auto shapes = d->shapes;
    for (RkShape* shape : shapes)
        shape->forgetMaterial(this);
    if (d->selected)
        announceSelection();
}

int RkMaterial::getNumMaterials()
{
    return allMaterials().size();
}

RkMaterial* RkMaterial::getMaterial(int index)
{
    return allMaterials().value(index, nullptr);
}

QList<RkMaterial*> RkMaterial::getSelectedMaterials()
{
    QList<RkMaterial*> selected;
    for (RkMaterial* m : allMaterials()) {
        if (m->d->selected)
            selected.append(m);
    }
    return selected;
}

void RkMaterial::clearMaterialSelection()
{
    bool changed = false;
    for (RkMaterial* m : allMaterials()) {
        changed = changed || m->d->selected;
        m->d->selected = false;
    }
    if (changed)
        announceSelection();
}

bool RkMaterial::isSelected() const
{
    return d->selected;
}

void RkMaterial::setSelected(bool selected)
{
    if (d->selected == selected)
        return;
    d->selected = selected;
    announceSelection();
}

QColor RkMaterial::getDiffuseColor() const
{
    return d->diffuse;
}

void RkMaterial::setDiffuseColor(const QColor& colour)
{
    if (!colour.isValid() || colour == d->diffuse)
        return;
    d->diffuse = colour;
    Q_EMIT diffuseColorChanged();
}

QListIterator<RkShape*> RkMaterial::shapeListIterator() const
{
    return QListIterator<RkShape*>(d->shapes);
}

QList<RkShape*> RkMaterial::getShapes() const
{
    return d->shapes;
}

void RkMaterial::addShape(RkShape* shape)
{
    if (!d->shapes.contains(shape))
        d->shapes.append(shape);
}

void RkMaterial::removeShape(RkShape* shape)
{
    d->shapes.removeAll(shape);
}

QImage RkMaterial::getDiffuseTexture() const
{
    return d->texture;
}

QString RkMaterial::getDiffuseTextureName() const
{
    return d->textureName;
}

void RkMaterial::setDiffuseTexture(const QImage& image, const QString& name)
{
    d->texture = image;
    d->textureName = name;
    Q_EMIT diffuseColorChanged();
}
