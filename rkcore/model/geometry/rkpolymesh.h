#pragma once

#include "geometry/rkgeometry.h"

#include <QVector>

// A triangle: its corners as vertex indices and as UV indices, and its material index.
struct RkTriFacet {
    int vertices[3] = {0, 0, 0};
    int uvs[3] = {0, 0, 0};
    quint8 material = 0;
};

// A quad, corners in order around the facet.
struct RkQuadFacet {
    int vertices[4] = {0, 0, 0, 0};
    int uvs[4] = {0, 0, 0, 0};
    quint8 material = 0;
};

// A polygon mesh of triangles and quads. Facets are walked all triangles first, then all quads.
class RKCORE_EXPORT RkPolyMesh : public RkGeometry
{
public:
    RkPolyMesh();
    ~RkPolyMesh() override;

    int getNumTris() const { return m_tris.size(); }
    const RkTriFacet* getTrisPtr() const { return m_tris.constData(); }
    int getNumQuads() const { return m_quads.size(); }
    const RkQuadFacet* getQuadsPtr() const { return m_quads.constData(); }

    // Adds a facet; refused (false) when an index does not name an existing vertex or UV value.
    bool addTri(const RkTriFacet& tri);
    bool addQuad(const RkQuadFacet& quad);

    int getNumFacets() const override;
    int getFacetSize(int facet) const override;
    const int* getFacetVertices(int facet) const override;
    const int* getFacetUVs(int facet) const override;
    int getFacetMaterial(int facet) const override;

private:
    QVector<RkTriFacet> m_tris;
    QVector<RkQuadFacet> m_quads;
};
