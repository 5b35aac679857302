#include "geometry/rkmeshdeformer.h"

#include <QtTest>

#include <cmath>
#include <limits>

namespace
{

bool near(const RkVec3& a, const RkVec3& b)
{
    return (a - b).length() < 1e-5f;
}

RkMeshDeformer makeDeformer()
{
    RkMeshDeformer d;
    d.setRestPositions({RkVec3(0, 0, 0), RkVec3(1, 0, 0), RkVec3(2, 0, 0)});
    RkMorphDeltas up;
    up.name = QStringLiteral("Up");
    up.indices = {0, 2};
    up.deltas = {RkVec3(0, 1, 0), RkVec3(0, 2, 0)};
    d.addMorph(up);
    RkMorphDeltas fwd;
    fwd.name = QStringLiteral("Forward");
    fwd.indices = {2};
    fwd.deltas = {RkVec3(0, 0, 1)};
    d.addMorph(fwd);
    return d;
}

} // namespace

class TestRkMeshDeformer : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void morphsAddWeightedOffsets();
    void badMorphEntriesAreDropped();
    void verticesFollowTheirBone();
};

void TestRkMeshDeformer::morphsAddWeightedOffsets()
{
    const RkMeshDeformer d = makeDeformer();
    QCOMPARE(d.findMorph(QStringLiteral("Forward")), 1);
    QCOMPARE(d.findMorph(QStringLiteral("Nothing")), -1);
    QVector<RkVec3> out;

    const float none[2] = {0, 0};
    d.deform(none, 2, nullptr, 0, out);
    QCOMPARE(out, d.getRestPositions());

    const float half[2] = {0.5f, 1.0f};
    d.deform(half, 2, nullptr, 0, out);
    QVERIFY(near(out[0], RkVec3(0, 0.5f, 0)));
    QVERIFY(near(out[1], RkVec3(1, 0, 0)));
    QVERIFY(near(out[2], RkVec3(2, 1, 1)));

    // Negative weights push the other way; missing weights count as 0; a weight that is not a
    // number shapes nothing.
    const float neg[1] = {-1.0f};
    d.deform(neg, 1, nullptr, 0, out);
    QVERIFY(near(out[2], RkVec3(2, -2, 0)));
    const float nan[2] = {std::numeric_limits<float>::quiet_NaN(), 1.0f};
    d.deform(nan, 2, nullptr, 0, out);
    QVERIFY(near(out[0], RkVec3(0, 0, 0)));
    QVERIFY(near(out[2], RkVec3(2, 0, 1)));

    // The rest positions are never touched by a deformation.
    QVERIFY(near(d.getRestPositions()[2], RkVec3(2, 0, 0)));
}

void TestRkMeshDeformer::badMorphEntriesAreDropped()
{
    RkMeshDeformer d = makeDeformer();
    RkMorphDeltas bad;
    bad.name = QStringLiteral("Bad");
    bad.indices = {-1, 3, 1, 1};
    bad.deltas = {RkVec3(1, 1, 1), RkVec3(1, 1, 1),
                  RkVec3(std::numeric_limits<float>::infinity(), 0, 0), RkVec3(0, 0, 4)};
    QCOMPARE(d.addMorph(bad), 2);
    QCOMPARE(d.getMorph(2).indices, QVector<int>({1}));

    const float w[3] = {0, 0, 1};
    QVector<RkVec3> out;
    d.deform(w, 3, nullptr, 0, out);
    QVERIFY(near(out[1], RkVec3(1, 0, 4)));
    for (const RkVec3& v : out)
        QVERIFY(std::isfinite(v.x) && std::isfinite(v.y) && std::isfinite(v.z));
}

void TestRkMeshDeformer::verticesFollowTheirBone()
{
    RkMeshDeformer d = makeDeformer();
    // Vertex 0 unbound, vertex 1 on bone 0, vertex 2 on bone 1 (no transform given for it in the
    // first pass).
    d.setVertexBones({-1, 0, 1});
    const RkXform turn = RkXform::rotationAbout(RkVec3(0, 0, 0), 0, 0, 90);
    QVector<RkVec3> out;
    const float up[1] = {1.0f};
    d.deform(up, 1, &turn, 1, out);
    QVERIFY(near(out[0], RkVec3(0, 1, 0)));
    QVERIFY(near(out[1], RkVec3(0, 1, 0)));
    QVERIFY(near(out[2], RkVec3(2, 2, 0)));

    // The morph shapes the rest pose first; the bone then carries the shaped vertex.
    const RkXform bones[2] = {RkXform(), turn};
    d.deform(up, 1, bones, 2, out);
    QVERIFY(near(out[1], RkVec3(1, 0, 0)));
    QVERIFY(near(out[2], RkVec3(-2, 2, 0)));
}

QTEST_APPLESS_MAIN(TestRkMeshDeformer)
#include "tst_rkmeshdeformer.moc"
