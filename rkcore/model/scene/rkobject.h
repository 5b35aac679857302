#pragma once

#include "geometry/rkmeshdeformer.h"
#include "geometry/rkvec3.h"
#include "scene/rkelement.h"

#include <QVector>

#include <memory>

class RkFloatProperty;
class RkGeometry;
class RkNode;
class RkShape;

// What a node shows: a geometry in the node's rest coordinates, the shapes that carry its
// materials, and morph targets driven by float properties. The deformed vertices are the rest
// vertices with each morph's offsets added at its property's value, carried by the owning node's
// world transform (a bone's transform for a figure's body part), or by the blend of its skin
// bones' transforms. Its element parent is the node.
class RKCORE_EXPORT RkObject : public RkElement
{
    Q_OBJECT
public:
    explicit RkObject(const QString& name = QString(), QObject* parent = nullptr);
    ~RkObject() override;

    virtual int getNumShapes() const;
    virtual RkShape* getShape(int index) const;
    virtual RkGeometry* getGeometry() const;

    // Takes ownership of the shape.
    void addShape(RkShape* shape);
    // Takes ownership of the geometry (the previous one is deleted) and emits uvsChanged() on
    // the object, its node and every material of its shapes.
    void setGeometry(RkGeometry* geometry);

    // The node the object belongs to, or null.
    RkNode* getNode() const;

    // A morph target driven by property (which the object watches, not owns). Entries that do
    // not fit the geometry are dropped.
    void addMorph(const RkMorphDeltas& morph, RkFloatProperty* property);
    int getNumMorphs() const;
    RkFloatProperty* getMorphProperty(int index) const;

    // Skins the geometry to bones of the node's figure (watched, not owned): influences name
    // bones by their place in this list, and a vertex with influences follows the blend of their
    // transforms relative to the node. A bone that is gone counts as unposed.
    void setSkinBones(const QList<RkNode*>& bones);
    QList<RkNode*> getSkinBones() const;
    // See RkMeshDeformer::setVertexInfluences.
    int setVertexInfluences(int vertex, const RkBoneInfluence* influences, int count);
    const RkMeshDeformer& getDeformer() const;

    // The vertices as shown: morphs applied, then the node's world transform (when world is
    // true). A geometry-less object gives none.
    void getDeformedVertices(QVector<RkVec3>& out, bool world = true) const;

    // Emits uvsChanged() on the object, its node and its materials.
    void notifyUVsChanged();

Q_SIGNALS:
    void uvsChanged();

private:
    struct Private;
    std::unique_ptr<Private> d;
};
