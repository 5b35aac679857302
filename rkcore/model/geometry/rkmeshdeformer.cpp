#include "geometry/rkmeshdeformer.h"

#include <algorithm>
#include <cmath>

RkMeshDeformer::RkMeshDeformer() = default;

RkMeshDeformer::~RkMeshDeformer() = default;

void RkMeshDeformer::setRestPositions(const QVector<RkVec3>& positions)
{
    m_rest = positions;
}

int RkMeshDeformer::addMorph(const RkMorphDeltas& morph)
{
    RkMorphDeltas clean;
    clean.name = morph.name;
    const int n = std::min(morph.indices.size(), morph.deltas.size());
    clean.indices.reserve(n);
    clean.deltas.reserve(n);
    for (int i = 0; i < n; ++i) {
        const int v = morph.indices[i];
        const RkVec3& d = morph.deltas[i];
        if (v < 0 || v >= m_rest.size())
            continue;
        if (!std::isfinite(d.x) || !std::isfinite(d.y) || !std::isfinite(d.z))
            continue;
        clean.indices.append(v);
        clean.deltas.append(d);
    }
    m_morphs.append(clean);
    return m_morphs.size() - 1;
}

int RkMeshDeformer::findMorph(const QString& name) const
{
    for (int i = 0; i < m_morphs.size(); ++i) {
        if (m_morphs[i].name == name)
            return i;
    }
    return -1;
}

void RkMeshDeformer::setVertexBones(const QVector<int>& bones)
{
    m_vertexBones = bones;
}

void RkMeshDeformer::deform(const float* weights, int numWeights, const RkXform* bones,
                            int numBones, QVector<RkVec3>& out) const
{
    out = m_rest;
    out.detach();
    RkVec3* p = out.data();

    const int morphs = std::min(numWeights, m_morphs.size());
    for (int m = 0; m < morphs; ++m) {
        const float w = weights[m];
        if (w == 0.0f || !std::isfinite(w))
            continue;
        const RkMorphDeltas& morph = m_morphs[m];
        const int* idx = morph.indices.constData();
        const RkVec3* d = morph.deltas.constData();
        for (int i = 0, n = morph.indices.size(); i < n; ++i) {
            RkVec3& v = p[idx[i]];
            v.x += d[i].x * w;
            v.y += d[i].y * w;
            v.z += d[i].z * w;
        }
    }

    if (!bones || numBones <= 0)
        return;
    const int n = std::min(m_vertexBones.size(), out.size());
    const int* vb = m_vertexBones.constData();
    for (int i = 0; i < n; ++i) {
        const int b = vb[i];
        if (b >= 0 && b < numBones)
            p[i] = bones[b].apply(p[i]);
    }
}
