#pragma once

#include "rkcoreglobal.h"
#include "rkmeshdeformer.h"
#include "rkvec3.h"

#include <QColor>
#include <QStringList>
#include <QVector>

#include <memory>

class RkPolyMesh;
class RkSubDMesh;

// The demo content's meshes, built in code: a humanoid figure (about 1.8 units tall, standing on
// y = 0 and facing +z) made of body parts, each part one UV island bound to one bone, with morph
// targets per body region; and a subdivision cage for the prop.
class RKCORE_EXPORT RkDemoMesh
{
public:
    enum Material { Skin = 0, Eyes = 1, Shirt = 2, Trousers = 3, NumMaterials = 4 };

    RkDemoMesh();
    ~RkDemoMesh();

    // A new copy of the figure's rest mesh; the caller owns it.
    std::unique_ptr<RkPolyMesh> createFigureMesh() const;
    static std::unique_ptr<RkSubDMesh> createPropMesh();

    static QStringList materialNames();
    static QVector<QColor> materialColours();

    // Bones in hierarchy order (every parent before its children), their parents (-1 for the
    // root) and the joint each turns about.
    static QStringList boneNames();
    static int boneParent(int bone);
    static RkVec3 jointCentre(int bone);
    // The bone each vertex of the figure mesh is bound to, as an index into boneNames().
    const QVector<int>& vertexBones() const;

    // The morph targets, named; offsets at full strength.
    const QVector<RkMorphDeltas>& morphs() const;
    // The body region a morph shapes ("Head", "Face", "Ears", "Body", "Arms", "Legs").
    static QString morphRegion(const QString& morph);

private:
    struct Private;
    std::unique_ptr<Private> d;
};
