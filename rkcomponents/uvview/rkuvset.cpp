#include "rkuvset.h"

#include "geometry/rkmap.h"
#include "geometry/rkpolymesh.h"
#include "geometry/rksubdmesh.h"

RkUVSet::RkUVSet(const RkGeometry* geometry)
{
    build(geometry);
}

RkUVSet::~RkUVSet() = default;

void RkUVSet::build(const RkGeometry* geometry)
{
    const RkMap* map = geometry ? geometry->getUVs() : nullptr;
    if (!map)
        return;
    const auto* subd = dynamic_cast<const RkSubDMesh*>(geometry);
    const auto* poly = dynamic_cast<const RkPolyMesh*>(geometry);
    if (subd) {
        // A cage is read whatever its map holds: the first two values of each entry.
        makePoints(map->getValuesPtr(), map->getDimension(), map->getNumValues());
    } else if (poly && map->getType() == RkMap::Point2D) {
        makePoints(map->getValuesPtr(), 2, map->getNumValues());
    } else {
        return;
    }
    if (m_numPoints < 1)
        return;

    const int facets = subd ? subd->getNumPatches() : poly->getNumTris() + poly->getNumQuads();
    const int corners = subd ? 4 * facets : 3 * poly->getNumTris() + 4 * poly->getNumQuads();
    m_polygonStore = std::make_unique<Polygon[]>(std::size_t(facets));
    m_cornerStore = std::make_unique<Point*[]>(std::size_t(corners));
    int polygon = 0;
    int corner = 0;
    if (subd) {
        addFacets(subd->getPatchesPtr(), subd->getNumPatches(), 4, polygon, corner);
    } else {
        addFacets(poly->getTrisPtr(), poly->getNumTris(), 3, polygon, corner);
        addFacets(poly->getQuadsPtr(), poly->getNumQuads(), 4, polygon, corner);
    }
    m_numPolygons = polygon;
    for (int i = 0; i + 1 < polygon; ++i)
        m_polygonStore[i].next = &m_polygonStore[i + 1];
    m_polygons = polygon > 0 ? &m_polygonStore[0] : nullptr;
}

void RkUVSet::makePoints(const float* values, int stride, int count)
{
    if (count < 1)
        return;
    m_pointStore = std::make_unique<Point[]>(std::size_t(count));
    for (int i = 0; i < count; ++i) {
        Point& p = m_pointStore[i];
        p.u = values[i * stride];
        p.v = stride > 1 ? values[i * stride + 1] : 0.0f;
        p.next = i + 1 < count ? &m_pointStore[i + 1] : nullptr;
    }
    m_points = &m_pointStore[0];
    m_numPoints = count;
}

template <typename Facet>
void RkUVSet::addFacets(const Facet* facets, int n, int corners, int& polygon, int& corner)
{
    for (int f = 0; f < n; ++f) {
        const Facet& facet = facets[f];
        // The map may have been replaced after the facets were made: a corner must name a value.
        bool inRange = true;
        for (int c = 0; c < corners; ++c)
            inRange = inRange && facet.uvs[c] >= 0 && facet.uvs[c] < m_numPoints;
        if (!inRange) {
            ++m_skipped;
            continue;
        }
        Polygon& p = m_polygonStore[polygon++];
        p.count = corners;
        p.material = facet.material;
        p.corners = &m_cornerStore[corner];
        for (int c = 0; c < corners; ++c)
            m_cornerStore[corner++] = &m_pointStore[facet.uvs[c]];
        if (m_materials.indexOf(int(p.material)) < 0)
            m_materials.append(int(p.material));
    }
}

void RkUVSet::setMaterialVisible(int index, bool on)
{
    if (index < 0)
        return;
    if (on && m_materials.indexOf(index) < 0)
        m_materials.append(index);
    else if (!on)
        m_materials.removeValue(index);
    changed();
}

void RkUVSet::clearMaterials()
{
    m_materials.clear();
    changed();
}

void RkUVSet::selectAllPoints()
{
    for (Point* p = m_points; p; p = p->next)
        p->setSelected(true);
    changed();
}

void RkUVSet::selectAllPolygons()
{
    for (Polygon* p = m_polygons; p; p = p->next)
        p->setSelected(true);
    changed();
}

void RkUVSet::clearPointSelection()
{
    for (Point* p = m_points; p; p = p->next)
        p->setSelected(false);
    changed();
}

void RkUVSet::clearPolygonSelection()
{
    for (Polygon* p = m_polygons; p; p = p->next)
        p->setSelected(false);
    changed();
}

void RkUVSet::invertPointSelection()
{
    for (Point* p = m_points; p; p = p->next)
        p->setSelected(!p->isSelected());
    changed();
}

void RkUVSet::invertPolygonSelection()
{
    for (Polygon* p = m_polygons; p; p = p->next)
        p->setSelected(!p->isSelected());
    changed();
}

void RkUVSet::selectCornersOfSelectedPolygons()
{
    for (Polygon* p = m_polygons; p; p = p->next) {
        if (p->isSelected()) {
            for (int c = 0; c < p->count; ++c)
                p->corners[c]->setSelected(true);
        }
    }
    changed();
}

void RkUVSet::selectPolygonsFromPoints()
{
    for (Polygon* p = m_polygons; p; p = p->next) {
        bool all = true;
        for (int c = 0; c < p->count; ++c)
            all = all && p->corners[c]->isSelected();
        p->setSelected(all);
    }
    changed();
}

void RkUVSet::setPointSelected(int index, bool on)
{
    if (index < 0 || index >= m_numPoints)
        return;
    m_pointStore[index].setSelected(on);
    changed();
}

void RkUVSet::setPolygonSelected(int index, bool on)
{
    if (index < 0 || index >= m_numPolygons)
        return;
    m_polygonStore[index].setSelected(on);
    changed();
}

const RkUVSet::Packed& RkUVSet::getPacked() const
{
    if (m_packed)
        return *m_packed;
    m_packed = std::make_unique<Packed>();
    Packed& packed = *m_packed;
    packed.positions.resize(2 * std::size_t(m_numPoints));
    for (int i = 0; i < m_numPoints; ++i) {
        packed.positions[2 * i] = m_pointStore[i].u;
        packed.positions[2 * i + 1] = m_pointStore[i].v;
        if (m_pointStore[i].isSelected())
            packed.selectedPoints.push_back(quint32(i));
    }
    // Only the few materials of one mesh: a small table of the visible ones.
    bool visible[256] = {};
    for (int i = 0; i < m_materials.count(); ++i) {
        if (m_materials[i] >= 0 && m_materials[i] < 256)
            visible[m_materials[i]] = true;
    }
    std::size_t edges = 0;
    for (int i = 0; i < m_numPolygons; ++i)
        edges += std::size_t(m_polygonStore[i].count);
    packed.lineIndices.reserve(2 * edges);
    const Point* base = m_pointStore.get();
    for (const Polygon* p = m_polygons; p; p = p->next) {
        if (p->material >= 256 || !visible[p->material] || p->count < 1)
            continue;
        const bool selected = p->isSelected();
        if (packed.runs.empty() || packed.runs.back().selected != selected)
            packed.runs.push_back({int(packed.lineIndices.size()), 0, selected});
        for (int c = 0; c < p->count; ++c) {
            packed.lineIndices.push_back(quint32(p->corners[c] - base));
            packed.lineIndices.push_back(quint32(p->corners[(c + 1) % p->count] - base));
        }
        packed.runs.back().count = int(packed.lineIndices.size()) - packed.runs.back().first;
    }
    return packed;
}
