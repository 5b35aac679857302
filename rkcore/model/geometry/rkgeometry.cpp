#include "geometry/rkgeometry.h"

#include "geometry/rkmap.h"

#include <algorithm>
#include <atomic>

namespace
{

std::atomic<quint64> nextRevision{1};

} // namespace

RkGeometry::RkGeometry() : m_uvs(std::make_unique<RkMap>(RkMap::Point2D))
{
    touch();
}

void RkGeometry::touch()
{
    m_revision = nextRevision++;
}

RkGeometry::~RkGeometry() = default;

int RkGeometry::addVertex(const RkVec3& v)
{
    m_vertices.append(v);
    touch();
    return m_vertices.size() - 1;
}

void RkGeometry::setVertex(int index, const RkVec3& v)
{
    if (index >= 0 && index < m_vertices.size())
        m_vertices[index] = v;
}

RkMap* RkGeometry::getUVs() const
{
    return m_uvs.get();
}

void RkGeometry::setUVs(RkMap* map)
{
    m_uvs.reset(map ? map : new RkMap(RkMap::Point2D));
}

int RkGeometry::addUV(float u, float v)
{
    return m_uvs->addPnt2(u, v);
}

bool RkGeometry::getBounds(RkVec3& min, RkVec3& max) const
{
    if (m_vertices.isEmpty())
        return false;
    min = max = m_vertices.first();
    for (const RkVec3& v : m_vertices) {
        min = RkVec3(std::min(min.x, v.x), std::min(min.y, v.y), std::min(min.z, v.z));
        max = RkVec3(std::max(max.x, v.x), std::max(max.y, v.y), std::max(max.z, v.z));
    }
    return true;
}

bool RkGeometry::verticesInRange(const int* indices, int n) const
{
    for (int i = 0; i < n; ++i) {
        if (indices[i] < 0 || indices[i] >= m_vertices.size())
            return false;
    }
    return true;
}

bool RkGeometry::uvsInRange(const int* indices, int n) const
{
    const int count = m_uvs->getNumValues();
    for (int i = 0; i < n; ++i) {
        if (indices[i] < 0 || indices[i] >= count)
            return false;
    }
    return true;
}
