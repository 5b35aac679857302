#include "demo/rkdemomesh.h"
#include "demo/rkdemoscene.h"
#include "geometry/rkmap.h"
#include "geometry/rkpolymesh.h"
#include "geometry/rksubdmesh.h"

#include <QtTest>

#include <algorithm>
#include <functional>
#include <numeric>

class TestRkDemoMesh : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void figureMeshIsSound();
    void uvsFormSeparateIslands();
    void morphsShapeTheirRegionOnly();
    void bonesFormAHierarchy();
    void propIsASubdivisionCage();
    void fitsTheDemoFigure();

private:
    RkDemoMesh m_demo;
};

void TestRkDemoMesh::figureMeshIsSound()
{
    const auto mesh = m_demo.createFigureMesh();
    QVERIFY(mesh->getNumVertices() > 1000);
    QVERIFY(mesh->getNumTris() > 0);
    QVERIFY(mesh->getNumQuads() > 0);
    QCOMPARE(mesh->getUVs()->getType(), RkMap::Point2D);
    QCOMPARE(m_demo.vertexBones().size(), mesh->getNumVertices());

    // Every material is used, and about where it should be: eyes on the head, trousers below.
    QVector<int> used(RkDemoMesh::NumMaterials, 0);
    for (int f = 0; f < mesh->getNumFacets(); ++f) {
        const int m = mesh->getFacetMaterial(f);
        QVERIFY(m < RkDemoMesh::NumMaterials);
        ++used[m];
        const RkVec3 p = mesh->getVertices()[mesh->getFacetVertices(f)[0]];
        if (m == RkDemoMesh::Eyes)
            QVERIFY(p.y > 1.55f && p.z > 0.05f);
        if (m == RkDemoMesh::Trousers)
            QVERIFY(p.y < 1.1f);
    }
    QVERIFY(!used.contains(0));
    QCOMPARE(RkDemoMesh::materialNames().size(), int(RkDemoMesh::NumMaterials));
    QCOMPARE(RkDemoMesh::materialColours().size(), int(RkDemoMesh::NumMaterials));

    RkVec3 lo, hi;
    QVERIFY(mesh->getBounds(lo, hi));
    QVERIFY(lo.y >= -0.01f && lo.y < 0.05f); // stands on the ground
    QVERIFY(hi.y > 1.7f && hi.y < 1.9f);
}

void TestRkDemoMesh::uvsFormSeparateIslands()
{
    // Join UV values that share a facet; every body part must come out as its own island, all
    // inside the unit square.
    const auto mesh = m_demo.createFigureMesh();
    const RkMap* uvs = mesh->getUVs();
    QVector<int> parent(uvs->getNumValues());
    std::iota(parent.begin(), parent.end(), 0);
    std::function<int(int)> find = [&](int i) {
        return parent[i] == i ? i : (parent[i] = find(parent[i]));
    };
    for (int f = 0; f < mesh->getNumFacets(); ++f) {
        const int* c = mesh->getFacetUVs(f);
        for (int k = 1; k < mesh->getFacetSize(f); ++k)
            parent[find(c[k])] = find(c[0]);
    }
    QSet<int> islands;
    for (int i = 0; i < parent.size(); ++i) {
        islands.insert(find(i));
        const RkPnt2 p = uvs->getPnt2(i);
        QVERIFY(p.x >= 0 && p.x <= 1 && p.y >= 0 && p.y <= 1);
    }
    QVERIFY2(islands.size() >= 10, qPrintable(QString::number(islands.size())));
}

void TestRkDemoMesh::morphsShapeTheirRegionOnly()
{
    const auto mesh = m_demo.createFigureMesh();
    const QVector<RkMorphDeltas>& morphs = m_demo.morphs();
    QVERIFY(morphs.size() >= 24);
    QSet<QString> regions;
    for (const RkMorphDeltas& m : morphs) {
        const QString region = RkDemoMesh::morphRegion(m.name);
        QVERIFY2(!region.isEmpty(), qPrintable(m.name));
        regions.insert(region);
        QVERIFY2(!m.indices.isEmpty(), qPrintable(m.name));
        float largest = 0;
        for (int i = 0; i < m.indices.size(); ++i) {
            const RkVec3 p = mesh->getVertices()[m.indices[i]];
            largest = std::max(largest, m.deltas[i].length());
            // Head, face and ear morphs stay on the head; leg morphs below the hips.
            if (region == QLatin1String("head") || region == QLatin1String("face") ||
                region == QLatin1String("ears"))
                QVERIFY2(p.y > 1.45f, qPrintable(m.name));
            if (region == QLatin1String("legs"))
                QVERIFY2(p.y < 1.0f, qPrintable(m.name));
            if (region == QLatin1String("arms"))
                QVERIFY2(std::fabs(p.x) > 0.15f, qPrintable(m.name));
        }
        // Visible: at least 5 mm somewhere.
        QVERIFY2(largest > 0.005f, qPrintable(m.name));
    }
    QCOMPARE(regions.size(), 6);
    // Morphs of one region may share vertices, but no two morphs are alike or share a name.
    for (int a = 0; a < morphs.size(); ++a) {
        for (int b = a + 1; b < morphs.size(); ++b) {
            QVERIFY(morphs[a].name != morphs[b].name);
            QVERIFY2(morphs[a].indices != morphs[b].indices || morphs[a].deltas != morphs[b].deltas,
                     qPrintable(morphs[a].name + " " + morphs[b].name));
        }
    }
}

void TestRkDemoMesh::bonesFormAHierarchy()
{
    const QStringList bones = RkDemoMesh::boneNames();
    QVERIFY(bones.size() >= 15);
    QCOMPARE(RkDemoMesh::boneParent(0), -1);
    for (int b = 1; b < bones.size(); ++b) {
        const int parent = RkDemoMesh::boneParent(b);
        QVERIFY(parent >= 0 && parent < b); // parents come first
    }
    // Every bone carries some of the mesh, and each vertex is bound to an existing bone.
    QVector<int> count(bones.size(), 0);
    for (int b : m_demo.vertexBones()) {
        QVERIFY(b >= 0 && b < bones.size());
        ++count[b];
    }
    QVERIFY(!count.contains(0));
    // The head turns about a point in the neck, above the shoulders.
    const RkVec3 head = RkDemoMesh::jointCentre(bones.indexOf(QStringLiteral("head")));
    QVERIFY(head.y > 1.45f && head.y < 1.6f);
}

void TestRkDemoMesh::propIsASubdivisionCage()
{
    const auto prop = RkDemoMesh::createPropMesh(RkVec3(0.6f, 0.2f, 0.3f));
    QCOMPARE(prop->getNumPatches(), 6 * 16);
    // Points shared between faces are welded: a closed cage of 4 by 4 patches per face has
    // 6 * 16 + 2 vertices.
    QCOMPARE(prop->getNumVertices(), 98);
    QCOMPARE(prop->getUVs()->getNumValues(), 6 * 25);
    RkVec3 lo, hi;
    QVERIFY(prop->getBounds(lo, hi));
    QVERIFY(lo.x > 0.3f); // beside the figure, not inside it
}

void TestRkDemoMesh::fitsTheDemoFigure()
{
    // The mesh turns about the figure's joints and has a target for each of its morphs, in the
    // region the figure files it under.
    const QStringList bones = RkDemoMesh::boneNames();
    QCOMPARE(bones.size(), rkDemoBones().size());
    for (const RkDemoBone& b : rkDemoBones()) {
        const int i = bones.indexOf(b.name);
        QVERIFY2(i >= 0, qPrintable(b.name));
        const RkVec3 c = RkDemoMesh::jointCentre(i);
        QVERIFY2((c - RkVec3(b.origin.x(), b.origin.y(), b.origin.z())).length() < 1e-4f,
                 qPrintable(b.name));
        const int parent = RkDemoMesh::boneParent(i);
        QCOMPARE(parent < 0 ? QString() : bones[parent], b.parent);
    }
    for (const RkDemoMorph& m : rkDemoMorphs()) {
        QCOMPARE(RkDemoMesh::morphRegion(m.name), m.region);
        bool found = false;
        for (const RkMorphDeltas& d : m_demo.morphs())
            found = found || d.name == m.name;
        QVERIFY2(found, qPrintable(m.name));
    }
    // Every bone's own mesh holds exactly its share of the figure's vertices.
    int total = 0;
    for (int b = 0; b < bones.size(); ++b) {
        const auto mesh = m_demo.createBoneMesh(b);
        QVERIFY2(mesh, qPrintable(bones[b]));
        total += mesh->getNumVertices();
        for (const RkMorphDeltas& d : m_demo.boneMorphs(b)) {
            for (int v : d.indices)
                QVERIFY(v >= 0 && v < mesh->getNumVertices());
        }
    }
    QCOMPARE(total, m_demo.createFigureMesh()->getNumVertices());
    QVERIFY(!m_demo.createBoneMesh(bones.size()));
}

QTEST_APPLESS_MAIN(TestRkDemoMesh)
#include "tst_rkdemomesh.moc"
