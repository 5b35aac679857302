#pragma once

#include "geometry/rkgeometry.h"

#include <QVector>

// A patch of a subdivision mesh: always four corners, as vertex and UV indices, and a material.
struct RkSubDPatch {
    int vertices[4] = {0, 0, 0, 0};
    int uvs[4] = {0, 0, 0, 0};
    quint8 material = 0;
};

// A subdivision-surface cage made of four-corner patches. Drawn as its cage, smooth shaded.
class RKCORE_EXPORT RkSubDMesh : public RkGeometry
{
public:
    RkSubDMesh();
    ~RkSubDMesh() override;

    int getNumPatches() const { return m_patches.size(); }
    const RkSubDPatch* getPatchesPtr() const { return m_patches.constData(); }
    // Refused (false) when an index does not name an existing vertex or UV value.
    bool addPatch(const RkSubDPatch& patch);

    int getNumFacets() const override { return m_patches.size(); }
    int getFacetSize(int) const override { return 4; }
    const int* getFacetVertices(int facet) const override { return m_patches[facet].vertices; }
    const int* getFacetUVs(int facet) const override { return m_patches[facet].uvs; }
    int getFacetMaterial(int facet) const override { return m_patches[facet].material; }

private:
    QVector<RkSubDPatch> m_patches;
};
