#pragma once

#include "rktsimplearray.h"

#include <QtGlobal>

#include <memory>
#include <vector>

class RkGeometry;

// The UV layout of one geometry, copied once when the record is built: the UV points in map
// order, the facets as loops of those points (triangles then quads, or patches), and the material
// indices whose facets are drawn. The record keeps no link to the scene after it is built.
class RkUVSet
{
public:
    static constexpr quint32 SelectedBit = 0x80000000u;

    struct Point {
        float u = 0.0f;
        float v = 0.0f;
        quint32 flags = 0;
        Point* next = nullptr;

        bool isSelected() const { return flags & SelectedBit; }
        void setSelected(bool on) { flags = on ? SelectedBit : 0; }
    };

    struct Polygon {
        int count = 0;
        quint32 material = 0;
        Point** corners = nullptr; // count entries in the record's corner store
        quint32 flags = 0;
        Polygon* next = nullptr;

        bool isSelected() const { return flags & SelectedBit; }
        void setSelected(bool on) { flags = on ? SelectedBit : 0; }
    };

    // What the fast drawing path sends to GL in a few calls: every point's (u, v), the visible
    // facets as pairs of point indices (one pair per edge, each loop in its own order), split into
    // runs of facets of one selected state in list order, and the selected points.
    struct Packed {
        struct Run {
            int first = 0; // into lineIndices
            int count = 0;
            bool selected = false;
        };
        std::vector<float> positions;
        std::vector<quint32> lineIndices;
        std::vector<Run> runs;
        std::vector<quint32> selectedPoints;
    };

    // The geometry is read here and not kept.
    explicit RkUVSet(const RkGeometry* geometry);
    ~RkUVSet();

    RkUVSet(const RkUVSet&) = delete;
    RkUVSet& operator=(const RkUVSet&) = delete;

    const Point* getPoints() const { return m_points; }
    const Polygon* getPolygons() const { return m_polygons; }
    int getNumPoints() const { return m_numPoints; }
    int getNumPolygons() const { return m_numPolygons; }
    // Facets left out because a corner named no UV value of the map.
    int getNumSkippedFacets() const { return m_skipped; }

    const RkTSimpleArray<int>& getMaterials() const { return m_materials; }
    bool isMaterialVisible(int index) const { return m_materials.indexOf(index) >= 0; }
    void setMaterialVisible(int index, bool on);
    void clearMaterials();

    void selectAllPoints();
    void selectAllPolygons();
    void clearPointSelection();
    void clearPolygonSelection();
    void invertPointSelection();
    void invertPolygonSelection();
    // Selects the corners of every selected polygon.
    void selectCornersOfSelectedPolygons();
    // A polygon becomes selected exactly when all its corners are.
    void selectPolygonsFromPoints();
    // Selection of single nodes, by their place in the lists.
    void setPointSelected(int index, bool on);
    void setPolygonSelected(int index, bool on);

    // Welding and unwelding leave the layout as it is.
    void weld() {}
    void unweld() {}

    // Built on first use and again after the selection or the visible materials changed.
    const Packed& getPacked() const;

private:
    void build(const RkGeometry* geometry);
    void makePoints(const float* values, int stride, int count);
    template <typename Facet>
    void addFacets(const Facet* facets, int n, int corners, int& polygon, int& corner);
    void changed() { m_packed.reset(); }

    Point* m_points = nullptr;
    Polygon* m_polygons = nullptr;
    int m_numPoints = 0;
    int m_numPolygons = 0;
    int m_skipped = 0;
    // The nodes live in three blocks; the lists run through them in order.
    std::unique_ptr<Point[]> m_pointStore;
    std::unique_ptr<Polygon[]> m_polygonStore;
    std::unique_ptr<Point*[]> m_cornerStore;
    RkTSimpleArray<int> m_materials{16};
    mutable std::unique_ptr<Packed> m_packed;
};
