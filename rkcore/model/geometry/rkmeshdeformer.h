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

// One weighted bone of a vertex.
struct RkBoneInfluence {
    int bone = -1;
    float weight = 0.0f;
};

// Deforms a mesh's rest positions: first every morph's offsets scaled by its weight are added,
// then each vertex is carried by a blend of up to four bone transforms (linear blend skinning).
// Rigid binding is the case of one bone of weight 1. Works on plain arrays so that it can be
// driven and measured without a scene.
class RKCORE_EXPORT RkMeshDeformer
{
public:
    static constexpr int MaxInfluences = 4;
    // Meshes above this many vertices are skinned on several threads; the result is the same.
    static constexpr int ThreadedVertexCount = 50000;

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

    // One bone index per vertex, weight 1; -1 leaves the vertex in place.
    void setVertexBones(const QVector<int>& bones);
    // The influences of one vertex. Negative bones and weights that are not finite or not
    // positive are dropped; of the rest the MaxInfluences heaviest are kept and scaled to sum 1.
    // A vertex left without influences stays in place. Returns the number kept.
    int setVertexInfluences(int vertex, const RkBoneInfluence* influences, int count);
    // Kept influences of a vertex (up to MaxInfluences, unused ones with bone -1).
    const RkBoneInfluence* getVertexInfluences(int vertex) const;
    bool hasInfluences() const { return !m_influences.isEmpty(); }

    // weights: numWeights entries, one per morph (missing ones count as 0, non-finite ones are
    // ignored). bones: numBones transforms indexed as the influences name them; an influence on a
    // bone without a transform counts as the identity.
    void deform(const float* weights, int numWeights, const RkXform* bones, int numBones,
                QVector<RkVec3>& out) const;
    // The same on one thread, whatever the size.
    void deformSingleThreaded(const float* weights, int numWeights, const RkXform* bones,
                              int numBones, QVector<RkVec3>& out) const;

private:
    void applyMorphs(const float* weights, int numWeights, RkVec3* p) const;
    void skin(const RkXform* bones, int numBones, RkVec3* p, int begin, int end) const;
    void deform(const float* weights, int numWeights, const RkXform* bones, int numBones,
                QVector<RkVec3>& out, bool threaded) const;

    QVector<RkVec3> m_rest;
    QVector<RkMorphDeltas> m_morphs;
    // MaxInfluences entries per vertex; empty when no vertex has any.
    QVector<RkBoneInfluence> m_influences;
};
