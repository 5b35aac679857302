#pragma once

#include "geometry/rkvec3.h"
#include "geometry/rkxform.h"
#include "rkcoreglobal.h"

#include <QString>
#include <QVector>

// Sparse offsets of one morph target: vertex indices and the offset of each at full strength.
struct RkMorphDeltas {
    QString name;
    QVector<int> indices;
    QVector<RkVec3> deltas;
};

// Deforms a mesh's rest positions: first every morph's offsets scaled by its weight are added,
// then each vertex follows the transform of the one bone it is bound to (rigid binding). Works on
// plain arrays so that it can be driven and measured without a scene.
class RKCORE_EXPORT RkMeshDeformer
{
public:
    RkMeshDeformer();
    ~RkMeshDeformer();

    void setRestPositions(const QVector<RkVec3>& positions);
    const QVector<RkVec3>& getRestPositions() const { return m_rest; }
    int getNumVertices() const { return m_rest.size(); }

    // Entries whose vertex index is out of range are dropped, as are offsets that are not finite.
    int addMorph(const RkMorphDeltas& morph);
    int getNumMorphs() const { return m_morphs.size(); }
    const RkMorphDeltas& getMorph(int index) const { return m_morphs[index]; }
    int findMorph(const QString& name) const;

    // One bone index per vertex; -1 (or an index with no transform given) leaves the vertex in
    // place.
    void setVertexBones(const QVector<int>& bones);
    const QVector<int>& getVertexBones() const { return m_vertexBones; }

    // weights: numWeights entries, one per morph (missing ones count as 0, non-finite ones are
    // ignored). bones: numBones transforms indexed as in setVertexBones.
    void deform(const float* weights, int numWeights, const RkXform* bones, int numBones,
                QVector<RkVec3>& out) const;

private:
    QVector<RkVec3> m_rest;
    QVector<RkMorphDeltas> m_morphs;
    QVector<int> m_vertexBones;
};
