#include "geometry/rkpolymesh.h"

RkPolyMesh::RkPolyMesh() = default;

RkPolyMesh::~RkPolyMesh() = default;

bool RkPolyMesh::addTri(const RkTriFacet& tri)
{
    if (!verticesInRange(tri.vertices, 3) || !uvsInRange(tri.uvs, 3))
        return false;
    m_tris.append(tri);
    touch();
    return true;
}

bool RkPolyMesh::addQuad(const RkQuadFacet& quad)
{
    if (!verticesInRange(quad.vertices, 4) || !uvsInRange(quad.uvs, 4))
        return false;
    m_quads.append(quad);
    touch();
    return true;
}

int RkPolyMesh::getNumFacets() const
{
    return m_tris.size() + m_quads.size();
}

int RkPolyMesh::getFacetSize(int facet) const
{
    return facet < m_tris.size() ? 3 : 4;
}

const int* RkPolyMesh::getFacetVertices(int facet) const
{
    if (facet < m_tris.size())
        return m_tris[facet].vertices;
    return m_quads[facet - m_tris.size()].vertices;
}

const int* RkPolyMesh::getFacetUVs(int facet) const
{
    if (facet < m_tris.size())
        return m_tris[facet].uvs;
    return m_quads[facet - m_tris.size()].uvs;
}

int RkPolyMesh::getFacetMaterial(int facet) const
{
    if (facet < m_tris.size())
        return m_tris[facet].material;
    return m_quads[facet - m_tris.size()].material;
}
