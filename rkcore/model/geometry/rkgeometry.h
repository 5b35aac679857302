#pragma once

#include "geometry/rkvec3.h"
#include "rkcoreglobal.h"

#include <QVector>

#include <memory>

class RkMap;

// The shape data of an object: its vertex positions and its texture coordinates. Subclasses add
// the facets (RkPolyMesh, RkSubDMesh). Facets refer to vertices and UV values by index; a mesh only
// accepts facets whose indices are in range, so readers can trust them.
class RKCORE_EXPORT RkGeometry
{
public:
    RkGeometry();
    virtual ~RkGeometry();

    RkGeometry(const RkGeometry&) = delete;
    RkGeometry& operator=(const RkGeometry&) = delete;

    int getNumVertices() const { return m_vertices.size(); }
    const RkVec3* getVerticesPtr() const { return m_vertices.constData(); }
    const QVector<RkVec3>& getVertices() const { return m_vertices; }
    int addVertex(const RkVec3& v);
    void setVertex(int index, const RkVec3& v);

    // Texture coordinates, a 2D map unless replaced; never null.
    RkMap* getUVs() const;
    // Takes ownership of map; null gives back an empty 2D map.
    void setUVs(RkMap* map);
    int addUV(float u, float v);

    // A number that no other geometry has had and that changes whenever vertices or facets are
    // added, so caches can tell a geometry and its topology apart from any earlier one.
    quint64 getRevision() const { return m_revision; }

    // Axis-aligned bounds of the vertices; false for a geometry without vertices.
    bool getBounds(RkVec3& min, RkVec3& max) const;

    // Corner count of every facet in order (3 or 4) and their vertex and UV indices, so that code
    // walking any mesh (drawing, picking) needs no knowledge of the subclass.
    virtual int getNumFacets() const = 0;
    virtual int getFacetSize(int facet) const = 0;
    virtual const int* getFacetVertices(int facet) const = 0;
    virtual const int* getFacetUVs(int facet) const = 0;
    virtual int getFacetMaterial(int facet) const = 0;

protected:
    void touch();
    bool verticesInRange(const int* indices, int n) const;
    bool uvsInRange(const int* indices, int n) const;

private:
    QVector<RkVec3> m_vertices;
    std::unique_ptr<RkMap> m_uvs;
    quint64 m_revision = 0;
};
