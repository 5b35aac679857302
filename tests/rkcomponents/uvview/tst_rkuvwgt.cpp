#include "geometry/rkmap.h"
#include "geometry/rkpolymesh.h"
#include "geometry/rksubdmesh.h"
#include "rktestmain.h"
#include "rkuvrenderer.h"
#include "rkuvset.h"
#include "rkuvwgt.h"
#include "scene/rkmaterial.h"
#include "scene/rknode.h"
#include "scene/rkobject.h"
#include "scene/rkshape.h"

#include <QOffscreenSurface>
#include <QOpenGLContext>
#include <QOpenGLFramebufferObject>

#include <random>

namespace
{

void addQuad(RkPolyMesh& mesh, int a, int b, int c, int e, quint8 material = 0)
{
    RkQuadFacet q;
    const int uvs[4] = {a, b, c, e};
    for (int i = 0; i < 4; ++i)
        q.vertices[i] = q.uvs[i] = uvs[i];
    q.material = material;
    QVERIFY(mesh.addQuad(q));
}

// Two unit-high quads side by side over the unit square, split at u = 0.5; the right one has
// material 1, and a triangle of material 2 sits in the left one.
std::unique_ptr<RkPolyMesh> twoQuads()
{
    auto mesh = std::make_unique<RkPolyMesh>();
    const float uv[][2] = {{0, 0}, {0.5f, 0}, {1, 0}, {0, 1}, {0.5f, 1}, {1, 1}};
    for (const auto& p : uv) {
        mesh->addVertex(RkVec3(p[0], p[1], 0));
        mesh->addUV(p[0], p[1]);
    }
    addQuad(*mesh, 0, 1, 4, 3, 0);
    addQuad(*mesh, 1, 2, 5, 4, 1);
    RkTriFacet tri;
    const int t[3] = {0, 1, 3};
    for (int i = 0; i < 3; ++i)
        tri.vertices[i] = tri.uvs[i] = t[i];
    tri.material = 2;
    mesh->addTri(tri);
    return mesh;
}

int cornerCount(const RkUVSet& set, int polygon)
{
    const RkUVSet::Polygon* p = set.getPolygons();
    for (int i = 0; i < polygon && p; ++i)
        p = p->next;
    return p ? p->count : -1;
}

QList<int> materialsOf(const RkUVSet& set)
{
    QList<int> list;
    for (int i = 0; i < set.getMaterials().count(); ++i)
        list.append(set.getMaterials()[i]);
    return list;
}

bool isRed(QRgb c)
{
    return qRed(c) > 200 && qGreen(c) < 60 && qBlue(c) < 60;
}

bool isBlack(QRgb c)
{
    return qRed(c) < 60 && qGreen(c) < 60 && qBlue(c) < 60;
}

// Whether some pixel within one pixel of (x, y) passes the test.
template <typename Test> bool near(const QImage& image, int x, int y, Test test)
{
    for (int dy = -1; dy <= 1; ++dy) {
        for (int dx = -1; dx <= 1; ++dx) {
            if (test(image.pixel(x + dx, y + dy)))
                return true;
        }
    }
    return false;
}

// A view whose picture can be read back as drawn: into the back buffer and read before any swap,
// since after a swap the back buffer may hold an older frame.
class ReadableUVWgt : public RkUVWgt
{
public:
    using RkUVWgt::setAutoBufferSwap;
};

QImage drawnNow(ReadableUVWgt& wgt)
{
    wgt.setAutoBufferSwap(false);
    wgt.updateGL();
    const QImage image = wgt.grabFrameBuffer();
    wgt.setAutoBufferSwap(true);
    return image;
}

} // namespace

class TestRkUVWgt : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void recordsFromMeshes();
    void recordsFromNodesAndMaterials();
    void bounds();
    void drawnImage();
    void fastPathDrawsTheSamePixels();
    void fastPathOnGrids_data();
    void fastPathOnGrids();
    void zoomPanAndFrame();
};

void TestRkUVWgt::recordsFromMeshes()
{
    // Triangles come first, then quads; materials in order of first occurrence.
    auto poly = twoQuads();
    RkUVSet set(poly.get());
    QCOMPARE(set.getNumPoints(), 6);
    QCOMPARE(set.getNumPolygons(), 3);
    QCOMPARE(cornerCount(set, 0), 3);
    QCOMPARE(cornerCount(set, 1), 4);
    QCOMPARE(set.getPolygons()->corners[2]->v, 1.0f);
    QCOMPARE(materialsOf(set), QList<int>({2, 0, 1}));

    // A cage is read whatever its map holds: here 3D values give their first two.
    RkSubDMesh cage;
    auto* map3 = new RkMap(RkMap::Point3D);
    map3->setValues({0, 0, 9, 1, 0, 9, 1, 1, 9, 0, 1, 9});
    cage.setUVs(map3);
    for (int i = 0; i < 4; ++i)
        cage.addVertex(RkVec3(0, 0, 0));
    RkSubDPatch patch;
    for (int i = 0; i < 4; ++i)
        patch.vertices[i] = patch.uvs[i] = i;
    patch.material = 5;
    QVERIFY(cage.addPatch(patch));
    RkUVSet cageSet(&cage);
    QCOMPARE(cageSet.getNumPolygons(), 1);
    QCOMPARE(cornerCount(cageSet, 0), 4);
    QCOMPARE(cageSet.getPolygons()->corners[2]->u, 1.0f);
    QCOMPARE(cageSet.getPolygons()->corners[2]->v, 1.0f);
    QCOMPARE(materialsOf(cageSet), QList<int>({5}));

    // A polygon mesh with a map of another type gives an empty record.
    auto scalar = twoQuads();
    scalar->setUVs(new RkMap(RkMap::Scalar));
    scalar->getUVs()->setValues({0, 1, 2, 3, 4, 5});
    RkUVSet empty(scalar.get());
    QCOMPARE(empty.getNumPoints(), 0);
    QCOMPARE(empty.getNumPolygons(), 0);
    RkUVSet none(nullptr);
    QCOMPARE(none.getNumPolygons(), 0);

    // A map replaced by a shorter one leaves facets naming values that are gone: skipped.
    auto shrunk = twoQuads();
    auto* shortMap = new RkMap;
    shortMap->setValues({0, 0, 0.5f, 0, 1, 0, 0, 1, 0.5f}); // 4 values: 0 to 3 (and a stray float)
    shrunk->setUVs(shortMap);
    RkUVSet guarded(shrunk.get());
    QCOMPARE(guarded.getNumPoints(), 4);
    QCOMPARE(guarded.getNumPolygons(), 1); // only the triangle 0 1 3
    QCOMPARE(guarded.getNumSkippedFacets(), 2);
    QCOMPARE(guarded.getPacked().lineIndices.size(), std::size_t(6));
}

void TestRkUVWgt::recordsFromNodesAndMaterials()
{
    auto* skin = new RkMaterial(QStringLiteral("TestSkin"));
    auto* cloth = new RkMaterial(QStringLiteral("TestCloth"));
    RkNode node;
    auto* object = new RkObject(QStringLiteral("Body"));
    auto* shape = new RkShape;
    shape->addMaterial(skin);  // index 0
    shape->addMaterial(cloth); // index 1
    object->addShape(shape);
    object->setGeometry(twoQuads().release());
    node.setObject(object);

    RkUVWgt wgt;
    wgt.setUV(&node);
    QCOMPARE(wgt.getUVSets().size(), 1);
    // A node without an object keeps what is shown.
    RkNode bare;
    wgt.setUV(&bare);
    QCOMPARE(wgt.getUVSets().size(), 1);

    // A material's record draws only that material's facets but keeps all points.
    wgt.setUV(cloth);
    QCOMPARE(wgt.getUVSets().size(), 1);
    const RkUVSet* set = wgt.getUVSets().first();
    QCOMPARE(set->getNumPoints(), 6);
    QCOMPARE(materialsOf(*set), QList<int>({1}));
    QCOMPARE(set->getPacked().lineIndices.size(), std::size_t(8));

    QList<RkMaterial*> both = {skin, cloth};
    wgt.setUVList(both);
    QCOMPARE(wgt.getUVSets().size(), 2);
    QCOMPARE(materialsOf(*wgt.getUVSets().at(0)), QList<int>({0}));

    wgt.setUV(static_cast<RkUVSet*>(nullptr));
    QVERIFY(wgt.getUVSets().isEmpty());

    QSignalSpy modes(&wgt, &RkUVWgt::selectionModeChanged);
    wgt.setSelectionMode(RkUVWgt::SelectPoints);
    QCOMPARE(modes.count(), 0);
    wgt.setSelectionMode(RkUVWgt::SelectPolygons);
    QCOMPARE(modes.count(), 1);
}

void TestRkUVWgt::bounds()
{
    const auto wide = RkUVRenderer::bounds(400, 200, 0.5f, 0.5f, 0.9f);
    QVERIFY(qAbs(wide.left + 0.6111) < 1e-4 && qAbs(wide.right - 1.6111) < 1e-4);
    QVERIFY(qAbs(wide.bottom + 0.0556) < 1e-4 && qAbs(wide.top - 1.0556) < 1e-4);
    const auto tall = RkUVRenderer::bounds(200, 400, 0.5f, 0.5f, 0.9f);
    QVERIFY(qAbs(tall.left + 0.0556) < 1e-4 && qAbs(tall.right - 1.0556) < 1e-4);
    QVERIFY(qAbs(tall.bottom + 0.6111) < 1e-4 && qAbs(tall.top - 1.6111) < 1e-4);

    // On screen: the wide widget's unit square starts 0.6111 / 2.2222 of the width in.
    ReadableUVWgt wgt;
    wgt.resize(400, 200);
    wgt.show();
    QVERIFY(QTest::qWaitForWindowExposed(&wgt));
    const QImage image = drawnNow(wgt);
    QVERIFY(near(image, 110, 100, isBlack));
    QVERIFY(near(image, 290, 100, isBlack));
    QVERIFY(!near(image, 105, 100, isBlack));
}

void TestRkUVWgt::drawnImage()
{
    // 200 by 200: u maps to x = 10 + 180 u, v to y = 190 - 180 v.
    auto mesh = twoQuads();
    auto* set = new RkUVSet(mesh.get());
    set->setPolygonSelected(2, true); // the right quad
    ReadableUVWgt wgt;
    wgt.resize(200, 200);
    wgt.setUV(set);
    wgt.show();
    QVERIFY(QTest::qWaitForWindowExposed(&wgt));
    const QImage image = drawnNow(wgt);
    QCOMPARE(image.size(), QSize(200, 200));
    // Unit square corners, black.
    for (const QPoint& p : {QPoint(10, 10), QPoint(190, 10), QPoint(10, 190), QPoint(190, 190)})
        QVERIFY2(near(image, p.x(), p.y(), isBlack), qPrintable(QString::number(p.x())));
    // The middle edge at u = 0.5 is drawn black by the left quad, then red by the selected one.
    QVERIFY(near(image, 100, 100, isRed));
    QVERIFY(!near(image, 55, 100, isRed));
    // The triangle's diagonal from (0.5, 0) to (0, 1) runs through (0.25, 0.5) = (55, 100).
    QVERIFY(near(image, 55, 100, isBlack));
    // Inside the right quad, away from every line: white.
    QCOMPARE(image.pixel(145, 100), qRgb(255, 255, 255));
    QCOMPARE(image.pixel(5, 100), qRgb(255, 255, 255));

    // Hidden material 1: the middle edge stays black (the left quad), nothing red remains.
    set->setMaterialVisible(1, false);
    const QImage hidden = drawnNow(wgt);
    QVERIFY(near(hidden, 100, 100, isBlack));
    QVERIFY(!near(hidden, 100, 100, isRed));

    // Weld and unweld move nothing.
    const QImage before = drawnNow(wgt);
    wgt.doWeld();
    wgt.doUnweld();
    QCOMPARE(drawnNow(wgt), before);
}

void TestRkUVWgt::fastPathDrawsTheSamePixels()
{
    QOffscreenSurface surface;
    surface.create();
    QOpenGLContext context;
    QVERIFY(context.create());
    QVERIFY(context.makeCurrent(&surface));
    QOpenGLFramebufferObject fbo(256, 192);
    QVERIFY(fbo.bind());
    glViewport(0, 0, 256, 192);
    RkUVRenderer::initialize();

    // A jumble of overlapping quads and triangles, some selected, over all materials.
    std::mt19937 random(7);
    std::uniform_real_distribution<float> coord(-0.2f, 1.2f);
    RkPolyMesh mesh;
    for (int i = 0; i < 400; ++i) {
        mesh.addVertex(RkVec3(0, 0, 0));
        mesh.addUV(coord(random), coord(random));
    }
    for (int i = 0; i < 150; ++i) {
        RkQuadFacet q;
        for (int c = 0; c < 4; ++c)
            q.vertices[c] = q.uvs[c] = int(random() % 400);
        q.material = quint8(random() % 3);
        mesh.addQuad(q);
        RkTriFacet t;
        for (int c = 0; c < 3; ++c)
            t.vertices[c] = t.uvs[c] = int(random() % 400);
        t.material = quint8(random() % 3);
        mesh.addTri(t);
    }
    QList<RkUVSet*> sets = {new RkUVSet(&mesh), new RkUVSet(&mesh)};
    for (int i = 0; i < 300; i += 7)
        sets[0]->setPolygonSelected(i, true);
    for (int i = 0; i < 400; i += 5)
        sets[1]->setPointSelected(i, true);
    sets[1]->setMaterialVisible(1, false);

    RkUVRenderer::paint(sets, 256, 192, 0.5f, 0.5f, 0.9f, RkUVRenderer::Reference);
    const QImage reference = fbo.toImage();
    RkUVRenderer::paint(sets, 256, 192, 0.5f, 0.5f, 0.9f, RkUVRenderer::Arrays);
    const QImage fast = fbo.toImage();
    qDeleteAll(sets);
    QVERIFY(reference != QImage(256, 192, reference.format()));
    QCOMPARE(fast, reference);
}

void TestRkUVWgt::fastPathOnGrids_data()
{
    QTest::addColumn<int>("cols");
    QTest::addColumn<int>("rows");
    QTest::addColumn<int>("size");
    QTest::addColumn<float>("zoom");
    QTest::addColumn<float>("centre");
    QTest::addColumn<float>("jitter");
    // Shared edges run both ways; lattices whose points fall on pixel edges and centres, and
    // jittered points with triangles, catch a path whose lines start or end differently.
    QTest::newRow("coarse") << 40 << 40 << 256 << 0.9f << 0.5f << 0.0f;
    QTest::newRow("coarse, jittered") << 40 << 40 << 256 << 0.9f << 0.5013f << 0.3f;
    QTest::newRow("odd, triangles") << 97 << 61 << 256 << 1.37f << 0.5013f << 0.8f;
    QTest::newRow("sub-pixel") << 300 << 300 << 256 << 0.9f << 0.5f << 0.0f;
    QTest::newRow("pixel lattice") << 256 << 256 << 256 << 1.0f << 0.5f << 0.0f;
    QTest::newRow("pixel lattice, triangles") << 256 << 256 << 256 << 0.9f << 0.5f << 0.8f;
    QTest::newRow("half-pixel lattice, triangles") << 512 << 512 << 256 << 1.0f << 0.5f << 0.8f;
}

void TestRkUVWgt::fastPathOnGrids()
{
    QFETCH(int, cols);
    QFETCH(int, rows);
    QFETCH(int, size);
    QFETCH(float, zoom);
    QFETCH(float, centre);
    QFETCH(float, jitter);
    QOffscreenSurface surface;
    surface.create();
    QOpenGLContext context;
    QVERIFY(context.create());
    QVERIFY(context.makeCurrent(&surface));
    QOpenGLFramebufferObject fbo(size, size);
    QVERIFY(fbo.bind());
    glViewport(0, 0, size, size);
    RkUVRenderer::initialize();
    // A grid with a third of its points moved by up to jitter / 2 cells; with a large jitter,
    // every third cell is split into two triangles.
    std::mt19937 random(11);
    std::uniform_real_distribution<float> shake(-0.5f, 0.5f);
    RkPolyMesh mesh;
    for (int r = 0; r <= rows; ++r) {
        for (int c = 0; c <= cols; ++c) {
            mesh.addVertex(RkVec3(0, 0, 0));
            const float j = random() % 3 == 0 ? jitter : 0.0f;
            mesh.addUV((float(c) + j * shake(random)) / float(cols),
                       (float(r) + j * shake(random)) / float(rows));
        }
    }
    for (int r = 0; r < rows; ++r)
        for (int c = 0; c < cols; ++c) {
            const int a = r * (cols + 1) + c;
            if (jitter > 0.5f && (r + c) % 3 == 0) {
                RkTriFacet t;
                const int t1[3] = {a, a + 1, a + cols + 2};
                for (int i = 0; i < 3; ++i)
                    t.vertices[i] = t.uvs[i] = t1[i];
                mesh.addTri(t);
                const int t2[3] = {a, a + cols + 2, a + cols + 1};
                for (int i = 0; i < 3; ++i)
                    t.vertices[i] = t.uvs[i] = t2[i];
                mesh.addTri(t);
            } else {
                addQuad(mesh, a, a + 1, a + cols + 2, a + cols + 1, quint8((r + c) % 4));
            }
        }
    QList<RkUVSet*> sets = {new RkUVSet(&mesh)};
    for (int i = 0; i < rows * cols; i += 13)
        sets[0]->setPolygonSelected(i, true);
    RkUVRenderer::paint(sets, size, size, centre, centre, zoom, RkUVRenderer::Reference);
    const QImage reference = fbo.toImage();
    RkUVRenderer::paint(sets, size, size, centre, centre, zoom, RkUVRenderer::Arrays);
    const QImage fast = fbo.toImage();
    qDeleteAll(sets);
    QCOMPARE(fast, reference);
}

void TestRkUVWgt::zoomPanAndFrame()
{
    RkUVWgt wgt;
    wgt.resize(300, 200);
    wgt.show();
    QVERIFY(QTest::qWaitForWindowExposed(&wgt));

    // The wheel zooms about the pointer: the UV point under it stays.
    const QPointF at(220, 60);
    const QPointF before = wgt.uvAt(at);
    QWheelEvent wheel(at, wgt.mapToGlobal(at.toPoint()), QPoint(), QPoint(0, 240), Qt::NoButton,
                      Qt::NoModifier, Qt::NoScrollPhase, false);
    QApplication::sendEvent(&wgt, &wheel);
    QVERIFY(wgt.getZoom() > 1.3f);
    QVERIFY(QLineF(wgt.uvAt(at), before).length() < 1e-4);

    // A middle drag carries the picture with the pointer.
    const QPointF grabbed = wgt.uvAt(QPointF(100, 100));
    QTest::mousePress(&wgt, Qt::MiddleButton, Qt::NoModifier, QPoint(100, 100));
    QMouseEvent move(QEvent::MouseMove, QPointF(140, 80), Qt::NoButton, Qt::MiddleButton,
                     Qt::NoModifier);
    QApplication::sendEvent(&wgt, &move);
    QTest::mouseRelease(&wgt, Qt::MiddleButton, Qt::NoModifier, QPoint(140, 80));
    QVERIFY(QLineF(wgt.uvAt(QPointF(140, 80)), grabbed).length() < 1e-4);

    wgt.frame();
    QCOMPARE(wgt.getZoom(), 0.9f);
    QCOMPARE(wgt.getCentre(), QPointF(0.5, 0.5));
}

RK_TEST_MAIN(TestRkUVWgt)
#include "tst_rkuvwgt.moc"
