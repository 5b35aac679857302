#include "geometry/rkmeshdeformer.h"

#include <QtTest>

#include <cmath>
#include <cstring>
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
    void blendedInfluences();
    void threadedSkinningIsBitIdentical();
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

void TestRkMeshDeformer::blendedInfluences()
{
    RkMeshDeformer d;
    d.setRestPositions({RkVec3(1, 0, 0), RkVec3(0, 1, 0), RkVec3(0, 0, 1)});
    const float nan = std::numeric_limits<float>::quiet_NaN();
    // Weights need not sum to 1: they are scaled to.
    const RkBoneInfluence quarter[2] = {{0, 0.5f}, {1, 1.5f}};
    QCOMPARE(d.setVertexInfluences(0, quarter, 2), 2);
    // Five influences: the lightest goes, as do a negative bone, a NaN and a negative weight.
    const RkBoneInfluence many[8] = {{0, 0.1f},  {1, 0.2f},  {2, 0.3f}, {3, 0.2f},
                                     {0, 0.05f}, {-1, 5.0f}, {2, nan},  {1, -3.0f}};
    QCOMPARE(d.setVertexInfluences(1, many, 8), 4);
    const RkBoneInfluence* kept = d.getVertexInfluences(1);
    float sum = 0;
    for (int i = 0; i < RkMeshDeformer::MaxInfluences; ++i) {
        QVERIFY(kept[i].bone >= 0);
        QVERIFY(kept[i].weight > 0.05f);
        sum += kept[i].weight;
    }
    QVERIFY(std::fabs(sum - 1.0f) < 1e-6f);
    const RkBoneInfluence rubbish[2] = {{0, nan}, {-2, 1.0f}};
    QCOMPARE(d.setVertexInfluences(2, rubbish, 2), 0);

    const RkXform bones[4] = {RkXform::translation(RkVec3(4, 0, 0)),
                              RkXform::translation(RkVec3(0, 8, 0)), RkXform(), RkXform()};
    QVector<RkVec3> out;
    d.deform(nullptr, 0, bones, 4, out);
    QVERIFY(near(out[0], RkVec3(1 + 4 * 0.25f, 8 * 0.75f, 0)));
    // Bones 2 and 3 stay put; bone 0 has 0.1 / 0.8 of it, bone 1 0.2 / 0.8.
    QVERIFY(near(out[1], RkVec3(4 * 0.125f, 1 + 8 * 0.25f, 0)));
    QVERIFY(near(out[2], RkVec3(0, 0, 1)));
}

void TestRkMeshDeformer::threadedSkinningIsBitIdentical()
{
    const int n = RkMeshDeformer::ThreadedVertexCount + 12345;
    QVector<RkVec3> rest(n);
    for (int i = 0; i < n; ++i)
        rest[i] = RkVec3(std::sin(i * 0.1f), float(i % 97) * 0.01f, std::cos(i * 0.37f));
    RkMeshDeformer d;
    d.setRestPositions(rest);
    for (int i = 0; i < n; ++i) {
        const RkBoneInfluence inf[3] = {{i % 5, 0.3f}, {(i + 1) % 5, 0.5f}, {(i + 3) % 5, 0.7f}};
        d.setVertexInfluences(i, inf, 3);
    }
    RkXform bones[5];
    for (int b = 0; b < 5; ++b)
        bones[b] = RkXform::rotationAbout(RkVec3(0, b * 0.2f, 0), 10.0f * b, 7.0f, -3.0f * b);
    QVector<RkVec3> threaded, single;
    d.deform(nullptr, 0, bones, 5, threaded);
    d.deformSingleThreaded(nullptr, 0, bones, 5, single);
    QCOMPARE(threaded.size(), n);
    QVERIFY(std::memcmp(threaded.constData(), single.constData(), sizeof(RkVec3) * n) == 0);
    QVERIFY(threaded[n - 1] != rest[n - 1]);
}

QTEST_APPLESS_MAIN(TestRkMeshDeformer)
#include "tst_rkmeshdeformer.moc"
