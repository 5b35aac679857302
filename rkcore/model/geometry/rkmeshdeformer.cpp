#include "geometry/rkmeshdeformer.h"

#include <algorithm>
#include <cmath>
#include <thread>
#include <vector>

RkMeshDeformer::RkMeshDeformer() = default;

RkMeshDeformer::~RkMeshDeformer() = default;

void RkMeshDeformer::setRestPositions(const QVector<RkVec3>& positions)
{
    m_rest = positions;
    if (!m_influences.isEmpty())
        m_influences.resize(m_rest.size() * MaxInfluences);
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
    m_influences.clear();
    for (int v = 0, n = std::min(bones.size(), m_rest.size()); v < n; ++v) {
        const RkBoneInfluence one{bones[v], 1.0f};
        setVertexInfluences(v, &one, 1);
    }
}

int RkMeshDeformer::setVertexInfluences(int vertex, const RkBoneInfluence* influences, int count)
{
    if (vertex < 0 || vertex >= m_rest.size())
        return 0;
    RkBoneInfluence kept[MaxInfluences];
    int n = 0;
    for (int i = 0; i < count; ++i) {
        const RkBoneInfluence& in = influences[i];
        if (in.bone < 0 || !std::isfinite(in.weight) || in.weight <= 0.0f)
            continue;
        // Keep the heaviest, in descending order.
        int at = n < MaxInfluences ? n++ : MaxInfluences;
        if (at == MaxInfluences) {
            if (in.weight <= kept[MaxInfluences - 1].weight)
                continue;
            at = MaxInfluences - 1;
        }
        while (at > 0 && kept[at - 1].weight < in.weight) {
            kept[at] = kept[at - 1];
            --at;
        }
        kept[at] = in;
    }
    float sum = 0.0f;
    for (int i = 0; i < n; ++i)
        sum += kept[i].weight;
    if (n == 0 && m_influences.isEmpty())
        return 0;
    if (m_influences.isEmpty())
        m_influences.resize(m_rest.size() * MaxInfluences);
    RkBoneInfluence* slot = m_influences.data() + vertex * MaxInfluences;
    for (int i = 0; i < MaxInfluences; ++i)
        slot[i] = i < n ? RkBoneInfluence{kept[i].bone, kept[i].weight / sum} : RkBoneInfluence();
    return n;
}

const RkBoneInfluence* RkMeshDeformer::getVertexInfluences(int vertex) const
{
    static const RkBoneInfluence none[MaxInfluences];
    if (m_influences.isEmpty() || vertex < 0 || vertex >= m_rest.size())
        return none;
    return m_influences.constData() + vertex * MaxInfluences;
}

void RkMeshDeformer::applyMorphs(const float* weights, int numWeights, RkVec3* p) const
{
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
}

void RkMeshDeformer::skin(const RkXform* bones, int numBones, RkVec3* p, int begin, int end) const
{
    const RkBoneInfluence* inf = m_influences.constData() + begin * MaxInfluences;
    for (int v = begin; v < end; ++v, inf += MaxInfluences) {
        if (inf[0].bone < 0)
            continue;
        const RkVec3 s = p[v];
        float x = 0.0f, y = 0.0f, z = 0.0f;
        for (int k = 0; k < MaxInfluences && inf[k].bone >= 0; ++k) {
            const float w = inf[k].weight;
            const int b = inf[k].bone;
            if (b >= numBones) {
                x += s.x * w;
                y += s.y * w;
                z += s.z * w;
                continue;
            }
            const float* r = bones[b].r;
            const RkVec3& t = bones[b].t;
            x += (r[0] * s.x + r[1] * s.y + r[2] * s.z + t.x) * w;
            y += (r[3] * s.x + r[4] * s.y + r[5] * s.z + t.y) * w;
            z += (r[6] * s.x + r[7] * s.y + r[8] * s.z + t.z) * w;
        }
        p[v] = RkVec3(x, y, z);
    }
}

void RkMeshDeformer::deform(const float* weights, int numWeights, const RkXform* bones,
                            int numBones, QVector<RkVec3>& out, bool threaded) const
{
    out = m_rest;
    out.detach();
    RkVec3* p = out.data();
    applyMorphs(weights, numWeights, p);

    if (!bones || numBones <= 0 || m_influences.isEmpty())
        return;
    const int n = out.size();
    const int threads = threaded && n > ThreadedVertexCount
                            ? int(std::min(4u, std::max(1u, std::thread::hardware_concurrency())))
                            : 1;
    if (threads <= 1) {
        skin(bones, numBones, p, 0, n);
        return;
    }
    // Every vertex is computed the same way whichever thread takes it, so the result does not
    // depend on the split.
    std::vector<std::thread> workers;
    const int chunk = (n + threads - 1) / threads;
    for (int t = 1; t < threads; ++t) {
        const int begin = std::min(n, t * chunk), end = std::min(n, begin + chunk);
        workers.emplace_back([=] { skin(bones, numBones, p, begin, end); });
    }
    skin(bones, numBones, p, 0, std::min(n, chunk));
    for (std::thread& w : workers)
        w.join();
}

void RkMeshDeformer::deform(const float* weights, int numWeights, const RkXform* bones,
                            int numBones, QVector<RkVec3>& out) const
{
    deform(weights, numWeights, bones, numBones, out, true);
}

void RkMeshDeformer::deformSingleThreaded(const float* weights, int numWeights,
                                          const RkXform* bones, int numBones,
                                          QVector<RkVec3>& out) const
{
    deform(weights, numWeights, bones, numBones, out, false);
}
