#include "scene/rkobject.h"

#include "geometry/rkgeometry.h"
#include "properties/rkfloatproperty.h"
#include "scene/rkmaterial.h"
#include "scene/rknode.h"
#include "scene/rkshape.h"

#include <QMatrix4x4>
#include <QPointer>

struct RkObject::Private {
    std::unique_ptr<RkGeometry> geometry;
    QList<RkShape*> shapes; // Qt children
    RkMeshDeformer deformer;
    QVector<QPointer<RkFloatProperty>> morphProperties;
    mutable QVector<float> weights;
    QVector<QPointer<RkNode>> skinBones;
    mutable QVector<RkXform> boneXforms;
};

namespace
{

RkXform toXform(const QMatrix4x4& m)
{
    RkXform x;
    for (int r = 0; r < 3; ++r) {
        for (int c = 0; c < 3; ++c)
            x.r[3 * r + c] = m(r, c);
    }
    x.t = RkVec3(m(0, 3), m(1, 3), m(2, 3));
    return x;
}

} // namespace

RkObject::RkObject(const QString& name, QObject* parent)
    : RkElement(parent, name), d(std::make_unique<Private>())
{
}

RkObject::~RkObject()
{
    // Shapes go first, so they leave their materials while the object is whole.
    qDeleteAll(d->shapes);
    d->shapes.clear();
}

int RkObject::getNumShapes() const
{
    return d->shapes.size();
}

RkShape* RkObject::getShape(int index) const
{
    return d->shapes.value(index, nullptr);
}

RkGeometry* RkObject::getGeometry() const
{
    return d->geometry.get();
}

void RkObject::addShape(RkShape* shape)
{
    if (!shape || d->shapes.contains(shape))
        return;
    shape->setParent(this);
    shape->setElementParent(this);
    d->shapes.append(shape);
}

void RkObject::setGeometry(RkGeometry* geometry)
{
    if (geometry == d->geometry.get())
        return;
    d->geometry.reset(geometry);
    // Morph targets belong to the old vertices.
    d->deformer = RkMeshDeformer();
    d->morphProperties.clear();
    d->skinBones.clear();
    if (geometry)
        d->deformer.setRestPositions(geometry->getVertices());
    notifyUVsChanged();
}

RkNode* RkObject::getNode() const
{
    return qobject_cast<RkNode*>(getElementParent());
}

void RkObject::addMorph(const RkMorphDeltas& morph, RkFloatProperty* property)
{
    if (!d->geometry)
        return;
    d->deformer.addMorph(morph);
    d->morphProperties.append(property);
}

int RkObject::getNumMorphs() const
{
    return d->morphProperties.size();
}

RkFloatProperty* RkObject::getMorphProperty(int index) const
{
    return d->morphProperties.value(index);
}

void RkObject::setSkinBones(const QList<RkNode*>& bones)
{
    d->skinBones.clear();
    for (RkNode* bone : bones)
        d->skinBones.append(bone);
}

QList<RkNode*> RkObject::getSkinBones() const
{
    QList<RkNode*> bones;
    for (const QPointer<RkNode>& bone : d->skinBones)
        bones.append(bone.data());
    return bones;
}

int RkObject::setVertexInfluences(int vertex, const RkBoneInfluence* influences, int count)
{
    return d->deformer.setVertexInfluences(vertex, influences, count);
}

const RkMeshDeformer& RkObject::getDeformer() const
{
    return d->deformer;
}

void RkObject::getDeformedVertices(QVector<RkVec3>& out, bool world) const
{
    if (!d->geometry) {
        out.clear();
        return;
    }
    const int n = d->morphProperties.size();
    d->weights.resize(n);
    for (int i = 0; i < n; ++i) {
        const RkFloatProperty* p = d->morphProperties[i];
        d->weights[i] = p ? p->getValue() : 0.0f;
    }
    const RkNode* owner = getNode();
    const QMatrix4x4 nodeWorld = owner ? owner->getWorldTransform() : QMatrix4x4();
    // Skin bones move relative to the node, which then carries the whole object.
    const int numBones = d->skinBones.size();
    d->boneXforms.resize(numBones);
    if (numBones > 0) {
        const QMatrix4x4 toNode = nodeWorld.inverted();
        for (int b = 0; b < numBones; ++b) {
            const RkNode* bone = d->skinBones[b];
            d->boneXforms[b] = bone ? toXform(toNode * bone->getWorldTransform()) : RkXform();
        }
    }
    d->deformer.deform(d->weights.constData(), n, d->boneXforms.constData(), numBones, out);
    const RkNode* node = world ? owner : nullptr;
    const RkXform xform = node ? toXform(nodeWorld) : RkXform();
    // The whole object follows its node.
    if (node) {
        for (RkVec3& v : out)
            v = xform.apply(v);
    }
}

void RkObject::notifyUVsChanged()
{
    Q_EMIT uvsChanged();
    if (RkNode* node = getNode())
        Q_EMIT node->uvsChanged();
    QList<RkMaterial*> seen;
    for (RkShape* shape : d->shapes) {
        for (int i = 0; i < shape->getNumMaterials(); ++i) {
            RkMaterial* m = shape->getMaterial(i);
            if (m && !seen.contains(m)) {
                seen.append(m);
                Q_EMIT m->uvsChanged();
            }
        }
    }
}
