#include "geometry/rkmap.h"
#include "geometry/rkpolymesh.h"
#include "geometry/rksubdmesh.h"
#include "geometry/rkvec3.h"
#include "geometry/rkxform.h"

#include <QtTest>

#include <cmath>
#include <limits>

Q_DECLARE_METATYPE(RkVec3)

class TestRkGeometry : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void normalize_data();
    void normalize();
    void xformComposition();
    void mapPointAccess();
    void meshRefusesFacetsOutOfRange();
    void facetWalkCoversTrisThenQuads();
};

void TestRkGeometry::normalize_data()
{
    QTest::addColumn<RkVec3>("in");
    QTest::addColumn<RkVec3>("out");
    QTest::addColumn<float>("length");
    const float inf = std::numeric_limits<float>::infinity();
    const float nan = std::numeric_limits<float>::quiet_NaN();
    QTest::newRow("axis") << RkVec3(0, 3, 0) << RkVec3(0, 1, 0) << 3.0f;
    QTest::newRow("3-4-0") << RkVec3(3, 4, 0) << RkVec3(0.6f, 0.8f, 0) << 5.0f;
    QTest::newRow("zero stays zero") << RkVec3() << RkVec3() << 0.0f;
    QTest::newRow("denormal has no direction") << RkVec3(1e-30f, 0, 0) << RkVec3() << 0.0f;
    QTest::newRow("infinite") << RkVec3(inf, 0, 0) << RkVec3() << 0.0f;
    QTest::newRow("not a number") << RkVec3(nan, 1, 0) << RkVec3() << 0.0f;
}

void TestRkGeometry::normalize()
{
    QFETCH(RkVec3, in);
    QFETCH(RkVec3, out);
    QFETCH(float, length);
    RkVec3 v = in;
    QCOMPARE(v.normalize(), length);
    QVERIFY(std::fabs(v.x - out.x) < 1e-6f);
    QVERIFY(std::fabs(v.y - out.y) < 1e-6f);
    QVERIFY(std::fabs(v.z - out.z) < 1e-6f);
    QVERIFY(std::isfinite(v.x) && std::isfinite(v.y) && std::isfinite(v.z));
}

void TestRkGeometry::xformComposition()
{
    // A quarter turn about z around (1, 0, 0) takes (2, 0, 0) to (1, 1, 0) and keeps the centre.
    const RkXform r = RkXform::rotationAbout(RkVec3(1, 0, 0), 0, 0, 90);
    const RkVec3 p = r.apply(RkVec3(2, 0, 0));
    QVERIFY(std::fabs(p.x - 1) < 1e-5f && std::fabs(p.y - 1) < 1e-5f && std::fabs(p.z) < 1e-5f);
    const RkVec3 c = r.apply(RkVec3(1, 0, 0));
    QVERIFY((c - RkVec3(1, 0, 0)).length() < 1e-5f);

    // Composition applies the right-hand transform first.
    const RkXform t = RkXform::translation(RkVec3(0, 0, 5));
    const RkVec3 a = (t * r).apply(RkVec3(2, 0, 0));
    const RkVec3 b = t.apply(r.apply(RkVec3(2, 0, 0)));
    QVERIFY((a - b).length() < 1e-5f);
    QVERIFY((a - RkVec3(1, 1, 5)).length() < 1e-5f);

    // x is turned first: y goes to z, which a turn about z then leaves alone.
    const RkVec3 q = RkXform::rotationXYZ(90, 0, 90).apply(RkVec3(0, 1, 0));
    QVERIFY((q - RkVec3(0, 0, 1)).length() < 1e-5f);
    const RkVec3 q2 = RkXform::rotationXYZ(0, 90, 0).apply(RkVec3(1, 0, 0));
    QVERIFY((q2 - RkVec3(0, 0, -1)).length() < 1e-5f);
}

void TestRkGeometry::mapPointAccess()
{
    RkMap uv(RkMap::Point2D);
    QCOMPARE(uv.getNumValues(), 0);
    QVERIFY(!uv.getPnt2ArrayPtr());
    QCOMPARE(uv.addPnt2(0.25f, 0.5f), 0);
    QCOMPARE(uv.addPnt2(1.0f, 0.0f), 1);
    QCOMPARE(uv.getNumValues(), 2);
    QCOMPARE(uv.getPnt2ArrayPtr()[1].x, 1.0f);
    QCOMPARE(uv.getPnt2ArrayPtr()[0].y, 0.5f);
    uv.setPnt2(1, 0.75f, 0.125f);
    QCOMPARE(uv.getPnt2(1).y, 0.125f);
    // Out of range reads give the origin, writes are ignored.
    QCOMPARE(uv.getPnt2(2).x, 0.0f);
    uv.setPnt2(-1, 9, 9);
    QCOMPARE(uv.getNumValues(), 2);

    // A 3D map is no point map: no 2D access, and a partial trailing value is dropped.
    RkMap pos(RkMap::Point3D);
    pos.setValues({1, 2, 3, 4, 5, 6, 7});
    QCOMPARE(pos.getType(), RkMap::Point3D);
    QCOMPARE(pos.getNumValues(), 2);
    QVERIFY(!pos.getPnt2ArrayPtr());
    QCOMPARE(pos.addPnt2(1, 1), -1);
}

void TestRkGeometry::meshRefusesFacetsOutOfRange()
{
    RkPolyMesh mesh;
    for (int i = 0; i < 4; ++i) {
        mesh.addVertex(RkVec3(float(i & 1), float(i >> 1), 0));
        mesh.addUV(float(i & 1), float(i >> 1));
    }
    RkTriFacet tri;
    tri.vertices[0] = 0;
    tri.vertices[1] = 1;
    tri.vertices[2] = 3;
    tri.uvs[0] = 0;
    tri.uvs[1] = 1;
    tri.uvs[2] = 3;
    tri.material = 255;
    const quint64 before = mesh.getRevision();
    QVERIFY(mesh.addTri(tri));
    const quint64 after = mesh.getRevision();
    QVERIFY(after != before);
    tri.uvs[2] = 4; // one past the UV map
    QVERIFY(!mesh.addTri(tri));
    tri.uvs[2] = 3;
    tri.vertices[1] = -1;
    QVERIFY(!mesh.addTri(tri));
    QCOMPARE(mesh.getRevision(), after); // refused facets change nothing
    // A new mesh never reuses a revision, even at the address of a deleted one.
    QVERIFY(RkPolyMesh().getRevision() > after);
    QCOMPARE(mesh.getNumTris(), 1);
    QCOMPARE(mesh.getTrisPtr()[0].material, quint8(255));

    RkSubDMesh subd;
    for (int i = 0; i < 4; ++i) {
        subd.addVertex(RkVec3(float(i), 0, 0));
        subd.addUV(0, 0);
    }
    RkSubDPatch patch;
    patch.vertices[3] = 3;
    patch.uvs[3] = 3;
    QVERIFY(subd.addPatch(patch));
    patch.vertices[3] = 4;
    QVERIFY(!subd.addPatch(patch));
    QCOMPARE(subd.getNumPatches(), 1);
    QCOMPARE(subd.getFacetSize(0), 4);
}

void TestRkGeometry::facetWalkCoversTrisThenQuads()
{
    RkPolyMesh mesh;
    for (int i = 0; i < 6; ++i) {
        mesh.addVertex(RkVec3(float(i), 0, 0));
        mesh.addUV(0, 0);
    }
    RkQuadFacet quad;
    const int qv[4] = {2, 3, 4, 5};
    std::copy(qv, qv + 4, quad.vertices);
    quad.material = 7;
    QVERIFY(mesh.addQuad(quad));
    RkTriFacet tri;
    tri.vertices[2] = 1;
    tri.material = 2;
    QVERIFY(mesh.addTri(tri));

    QCOMPARE(mesh.getNumFacets(), 2);
    QCOMPARE(mesh.getFacetSize(0), 3);
    QCOMPARE(mesh.getFacetMaterial(0), 2);
    QCOMPARE(mesh.getFacetSize(1), 4);
    QCOMPARE(mesh.getFacetVertices(1)[3], 5);
    QCOMPARE(mesh.getFacetMaterial(1), 7);

    RkVec3 lo, hi;
    QVERIFY(mesh.getBounds(lo, hi));
    QCOMPARE(hi.x, 5.0f);
    RkPolyMesh empty;
    QVERIFY(!empty.getBounds(lo, hi));
}

QTEST_APPLESS_MAIN(TestRkGeometry)
#include "tst_rkgeometry.moc"
