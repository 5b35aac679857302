#pragma once

#include "geometry/rkmeshdeformer.h"
#include "geometry/rkvec3.h"

#include <QColor>
#include <QStringList>
#include <QVector>

#include <memory>

class RkNode;
class RkPolyMesh;
class RkSubDMesh;

// The demo content's meshes, built in code: a humanoid figure (about 1.8 units tall, standing on
// y = 0, facing +z, arms out to the sides) made of body parts, each part one UV island that
// follows one bone, with morph targets per body region; and a subdivision cage for the prop.
class RkDemoMesh
{
public:
    enum Material { Skin = 0, Eyes = 1, Shirt = 2, Trousers = 3, NumMaterials = 4 };

    RkDemoMesh();
    ~RkDemoMesh();

    // The whole figure in its rest pose, as one mesh; the caller owns it.
    std::unique_ptr<RkPolyMesh> createFigureMesh() const;
    // The bone each vertex of the whole mesh follows, as an index into boneNames().
    const QVector<int>& vertexBones() const;
    // The morph targets of the whole mesh; offsets at full strength.
    const QVector<RkMorphDeltas>& morphs() const;

    // The part of the figure one bone carries, with its own vertices and UV values (the UVs keep
    // their place in the figure's layout); null for a bone that carries nothing.
    std::unique_ptr<RkPolyMesh> createBoneMesh(int bone) const;
    // The morph targets restricted to that bone's mesh; morphs that do not touch it are left out.
    QVector<RkMorphDeltas> boneMorphs(int bone) const;

    // A rounded box of four-corner patches around centre.
    static std::unique_ptr<RkSubDMesh> createPropMesh(const RkVec3& centre);

    static QStringList materialNames();
    static QVector<QColor> materialColours();

    // Bones in hierarchy order (every parent before its children), their parents (-1 for the
    // root) and the joint each turns about.
    static QStringList boneNames();
    static int boneParent(int bone);
    static RkVec3 jointCentre(int bone);

    // The body region a morph shapes: "head", "face", "ears", "body", "arms" or "legs".
    static QString morphRegion(const QString& morph);

    // Gives a figure (an RkSkeleton) and each of its bones their objects: every bone carries its
    // part of the mesh, driven by the figure's morph properties of the same names; the figure's
    // own object holds the shared materials. Bones the mesh does not know stay empty. Anything
    // built before is replaced.
    static void buildFigure(RkNode* figure);
    // Gives a node the prop's subdivision mesh around the node's origin, with its own material.
    static void buildProp(RkNode* prop);
    // The mesh every figure is built from, made once.
    static const RkDemoMesh& instance();

private:
    struct Private;
    std::unique_ptr<Private> d;
};
