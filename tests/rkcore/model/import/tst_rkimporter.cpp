#include "geometry/rkgeometry.h"
#include "geometry/rkmap.h"
#include "import/rkimporter.h"
#include "properties/rkfloatproperty.h"
#include "rktestmain.h"
#include "scene/rkbone.h"
#include "scene/rkmaterial.h"
#include "scene/rkobject.h"
#include "scene/rkscene.h"
#include "scene/rkshape.h"
#include "scene/rkskeleton.h"

#include <QFile>
#include <QRandomGenerator>
#include <QTemporaryDir>

#include <cmath>

namespace
{

const QString Models = QStringLiteral("/usr/share/assimp/models/");

QString model(const QString& relative)
{
    return Models + relative;
}

#define REQUIRE_MODEL(path)                                                                        \
    if (!QFile::exists(path))                                                                      \
    QSKIP("Debian's assimp-testmodels is not installed (scripts/setup.sh installs it)")

QVector<RkVec3> deformed(const RkNode* node)
{
    QVector<RkVec3> out;
    if (node && node->getObject())
        node->getObject()->getDeformedVertices(out);
    return out;
}

QList<RkFloatProperty*> morphsOf(const RkNode* node)
{
    QList<RkFloatProperty*> morphs;
    for (RkProperty* p : node->getProperties()) {
        if (p->getPath().startsWith(QLatin1String("Morphs/")))
            morphs.append(qobject_cast<RkFloatProperty*>(p));
    }
    return morphs;
}

RkNode* importInto(const QString& path, QString* error = nullptr)
{
    RkImporter importer;
    if (!importer.read(path)) {
        if (error)
            *error = importer.errorString();
        return nullptr;
    }
    return importer.addToScene(rkScene);
}

// Names of the scene's nodes, in order: what a refused import must leave alone.
QStringList sceneState()
{
    QStringList names;
    for (RkNode* node : rkScene->getNodes())
        names.append(node->getName());
    return names;
}

bool sameVertices(const QVector<RkVec3>& a, const QVector<RkVec3>& b)
{
    if (a.size() != b.size())
        return false;
    for (int i = 0; i < a.size(); ++i) {
        if ((a[i] - b[i]).length() > 1e-5f)
            return false;
    }
    return true;
}

// A glTF file whose one triangle list is skinned to `joints` joints, four per vertex, each with
// some weight, so that every joint becomes a bone; with or without inverse bind matrices.
QByteArray skinnedGltf(int joints, bool bindMatrices = true)
{
    const int vertices = ((joints + 3) / 4 + 2) / 3 * 3;
    QByteArray positions, jointIds, weights;
    for (int v = 0; v < vertices; ++v) {
        const float p[3] = {float(v), float(v % 3), 0.0f};
        positions.append(reinterpret_cast<const char*>(p), sizeof p);
        for (int k = 0; k < 4; ++k) {
            const quint16 joint = quint16(qMin(v * 4 + k, joints - 1));
            jointIds.append(reinterpret_cast<const char*>(&joint), sizeof joint);
            const float w = 0.25f;
            weights.append(reinterpret_cast<const char*>(&w), sizeof w);
        }
    }
    QByteArray matrices;
    for (int j = 0; bindMatrices && j < joints; ++j) {
        for (int k = 0; k < 16; ++k) {
            const float m = k % 5 == 0 ? 1.0f : 0.0f;
            matrices.append(reinterpret_cast<const char*>(&m), sizeof m);
        }
    }
    const QByteArray buffer = positions + jointIds + weights + matrices;
    QString nodes = QStringLiteral("{\"mesh\":0,\"skin\":0}");
    QString jointList, sceneNodes = QStringLiteral("0");
    for (int j = 1; j <= joints; ++j) {
        nodes += QStringLiteral(",{\"name\":\"j%1\"}").arg(j);
        jointList += (j > 1 ? QStringLiteral(",") : QString()) + QString::number(j);
        sceneNodes += QStringLiteral(",%1").arg(j);
    }
    const QString json =
        QStringLiteral(
            "{\"asset\":{\"version\":\"2.0\"},\"scene\":0,\"scenes\":[{\"nodes\":[%1]}],"
            "\"nodes\":[%2],\"skins\":[{\"joints\":[%3]%12}],"
            "\"meshes\":[{\"primitives\":[{\"attributes\":{\"POSITION\":0,\"JOINTS_0\":1,"
            "\"WEIGHTS_0\":2}}]}],"
            "\"accessors\":[{\"bufferView\":0,\"componentType\":5126,\"count\":%4,"
            "\"type\":\"VEC3\",\"min\":[0,0,0],\"max\":[%5,2,0]},"
            "{\"bufferView\":1,\"componentType\":5123,\"count\":%4,\"type\":\"VEC4\"},"
            "{\"bufferView\":2,\"componentType\":5126,\"count\":%4,\"type\":\"VEC4\"},"
            "{\"bufferView\":3,\"componentType\":5126,\"count\":%13,\"type\":\"MAT4\"}],"
            "\"bufferViews\":[{\"buffer\":0,\"byteOffset\":0,\"byteLength\":%6},"
            "{\"buffer\":0,\"byteOffset\":%6,\"byteLength\":%7},"
            "{\"buffer\":0,\"byteOffset\":%8,\"byteLength\":%9},"
            "{\"buffer\":0,\"byteOffset\":%14,\"byteLength\":%15}],"
            "\"buffers\":[{\"byteLength\":%10,"
            "\"uri\":\"data:application/octet-stream;base64,%11\"}]}")
            .arg(sceneNodes, nodes, jointList)
            .arg(vertices)
            .arg(vertices - 1)
            .arg(positions.size())
            .arg(jointIds.size())
            .arg(positions.size() + jointIds.size())
            .arg(weights.size())
            .arg(buffer.size())
            .arg(QString::fromLatin1(buffer.toBase64()))
            .arg(bindMatrices ? QStringLiteral(",\"inverseBindMatrices\":3") : QString())
            .arg(joints)
            .arg(positions.size() + jointIds.size() + weights.size())
            .arg(qMax(matrices.size(), 64));
    return json.toUtf8();
}

} // namespace

class TestRkImporter : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init() { rkScene->clear(); }
    void morphTargets();
    void skinnedFigure_data();
    void skinnedFigure();
    void materialsAndUVs();
    void saveClearOpen();
    void missingOrChangedSource();
    void badFiles_data();
    void badFiles();
    void mutatedFiles();
};

void TestRkImporter::morphTargets()
{
    const QString path = model("glTF2/glTF-Sample-Models/AnimatedMorphCube-glTF/"
                               "AnimatedMorphCube.gltf");
    REQUIRE_MODEL(path);
    RkNode* node = importInto(path);
    QVERIFY(node);
    QVERIFY(!qobject_cast<RkSkeleton*>(node));
    const QList<RkFloatProperty*> morphs = morphsOf(node);
    QCOMPARE(morphs.size(), 2);
    const QVector<RkVec3> rest = deformed(node);
    QCOMPARE(rest.size(), node->getObject()->getGeometry()->getNumVertices());
    QVector<QVector<RkVec3>> shaped;
    for (RkFloatProperty* morph : morphs) {
        QCOMPARE(morph->getPath(), QStringLiteral("Morphs/Cube"));
        QCOMPARE(morph->getMin(), 0.0f);
        QCOMPARE(morph->getMax(), 1.0f);
        QVERIFY(morph->getDisplayAsPercent());
        morph->adjustValue(3.0f);
        QCOMPARE(morph->getValue(), 1.0f);
        shaped.append(deformed(node));
        QVERIFY(!sameVertices(shaped.last(), rest));
        morph->setValue(0.0f);
        QVERIFY(sameVertices(deformed(node), rest));
    }
    QVERIFY(!sameVertices(shaped[0], shaped[1]));
    // The cube sits on the floor.
    RkVec3 lo, hi;
    QVERIFY(node->getObject()->getGeometry()->getBounds(lo, hi));
    QVERIFY(std::fabs(lo.y) < 1e-5f);
}

void TestRkImporter::skinnedFigure_data()
{
    QTest::addColumn<QString>("path");
    QTest::addColumn<QString>("boneName");
    QTest::newRow("glTF") << model("glTF2/simple_skin/simple_skin.gltf") << QString();
    QTest::newRow("DirectX, Z up") << model("X/BCN_Epileptic.X") << QStringLiteral("B_Knee_Left");
    QTest::newRow("FBX") << model("FBX/animation_with_skeleton.fbx") << QString();
}

void TestRkImporter::skinnedFigure()
{
    QFETCH(QString, path);
    QFETCH(QString, boneName);
    REQUIRE_MODEL(path);
    auto* figure = qobject_cast<RkSkeleton*>(importInto(path));
    QVERIFY(figure);
    QList<RkBone*> bones;
    figure->getAllBones(bones);
    QVERIFY(!bones.isEmpty());

    // Upright on the floor at about a person's size or less.
    const QVector<RkVec3> rest = deformed(figure);
    RkVec3 lo = rest[0], hi = rest[0];
    for (const RkVec3& v : rest) {
        lo = RkVec3(std::min(lo.x, v.x), std::min(lo.y, v.y), std::min(lo.z, v.z));
        hi = RkVec3(std::max(hi.x, v.x), std::max(hi.y, v.y), std::max(hi.z, v.z));
    }
    QVERIFY(std::fabs(lo.y) < 1e-4f);
    const float largest = std::max({hi.x - lo.x, hi.y - lo.y, hi.z - lo.z});
    QVERIFY2(largest > 0.3f && largest < 3.01f, qPrintable(QString::number(largest)));
    if (path.contains(QLatin1String("BCN")))
        QVERIFY(hi.y - lo.y > hi.z - lo.z && hi.y - lo.y > hi.x - lo.x);

    // The bone to turn: the one named, else the heaviest of the first skinned vertex.
    const RkObject* object = figure->getObject();
    const QList<RkNode*> skin = object->getSkinBones();
    const RkMeshDeformer& deformer = object->getDeformer();
    RkBone* bone = boneName.isEmpty() ? nullptr : figure->findBone(boneName);
    QVERIFY(boneName.isEmpty() || bone);
    int boneIndex = skin.indexOf(bone);
    for (int v = 0; v < rest.size() && boneIndex < 0; ++v)
        boneIndex = deformer.getVertexInfluences(v)[0].bone;
    QVERIFY(boneIndex >= 0);
    bone = qobject_cast<RkBone*>(skin[boneIndex]);
    QVERIFY(bone);
    QCOMPARE(bone->getXRotate()->getPath(), QStringLiteral("Pose"));
    QCOMPARE(bone->getYTranslate()->getPath(), QStringLiteral("Pose"));

    // Turning it moves vertices, and only those it or a bone below it weighs.
    QSet<int> family{boneIndex};
    for (int b = 0; b < skin.size(); ++b) {
        for (const RkNode* up = skin[b]; up; up = up->getNodeParent()) {
            if (up == bone)
                family.insert(b);
        }
    }
    bone->getZRotate()->setValue(40.0f);
    const QVector<RkVec3> posed = deformed(figure);
    int moved = 0;
    for (int v = 0; v < rest.size(); ++v) {
        if ((posed[v] - rest[v]).length() < 1e-5f)
            continue;
        ++moved;
        const RkBoneInfluence* inf = deformer.getVertexInfluences(v);
        bool weighted = false;
        for (int k = 0; k < RkMeshDeformer::MaxInfluences; ++k)
            weighted = weighted || family.contains(inf[k].bone);
        QVERIFY2(weighted, qPrintable(QStringLiteral("vertex %1 moved").arg(v)));
    }
    QVERIFY(moved > 0);
    bone->getZRotate()->setValue(0.0f);
    QVERIFY(sameVertices(deformed(figure), rest));
}

void TestRkImporter::materialsAndUVs()
{
    const QString path = model("OBJ/spider.obj");
    REQUIRE_MODEL(path);
    RkNode* node = importInto(path);
    QVERIFY(node);
    const RkObject* object = node->getObject();
    QCOMPARE(object->getNumShapes(), 19);
    const RkShape* shape = object->getShape(0);
    QStringList names;
    int textured = 0;
    for (int i = 0; i < shape->getNumMaterials(); ++i) {
        names.append(shape->getMaterial(i)->getName());
        if (!shape->getMaterial(i)->getDiffuseTexture().isNull())
            ++textured;
    }
    // Brusttex is in the material library but no mesh uses it.
    for (const char* expected : {"Skin", "HLeibTex", "BeinTex", "Augentex"})
        QVERIFY2(names.contains(QLatin1String(expected)), qPrintable(names.join(',')));
    QCOMPARE(textured, 4);
    const RkMaterial* skin = shape->getMaterial(names.indexOf(QStringLiteral("Skin")));
    QCOMPARE(skin->getDiffuseTextureName(), QStringLiteral("wal67ar_small.jpg"));
    QVERIFY(std::abs(skin->getDiffuseColor().red() - 212) <= 1); // Kd 0.831

    // Every facet corner has a UV inside the picture, and they are not all the same.
    const RkGeometry* g = object->getGeometry();
    const RkMap* uvs = g->getUVs();
    QCOMPARE(uvs->getNumValues(), g->getNumVertices());
    QSet<QPair<float, float>> distinct;
    for (int f = 0; f < g->getNumFacets(); ++f) {
        for (int c = 0; c < g->getFacetSize(f); ++c) {
            const RkPnt2 uv = uvs->getPnt2(g->getFacetUVs(f)[c]);
            distinct.insert({uv.x, uv.y});
        }
    }
    QVERIFY(distinct.size() > 100);
    // The spider is modelled some 200 units wide; it comes in at a size one can handle.
    RkVec3 lo, hi;
    QVERIFY(g->getBounds(lo, hi));
    QVERIFY(std::max({hi.x - lo.x, hi.y - lo.y, hi.z - lo.z}) <= 1.0001f);
}

void TestRkImporter::saveClearOpen()
{
    QTemporaryDir dir;
    const QString source = model("X/BCN_Epileptic.X");
    const QString cube = model("glTF2/glTF-Sample-Models/AnimatedMorphCube-glTF/");
    REQUIRE_MODEL(source);
    QVERIFY(QFile::copy(source, dir.filePath("figure.x")));
    QVERIFY(QFile::copy(cube + "AnimatedMorphCube.gltf", dir.filePath("AnimatedMorphCube.gltf")));
    QVERIFY(QFile::copy(cube + "AnimatedMorphCube.bin", dir.filePath("AnimatedMorphCube.bin")));

    auto* figure = qobject_cast<RkSkeleton*>(importInto(dir.filePath("figure.x")));
    RkNode* prop = importInto(dir.filePath("AnimatedMorphCube.gltf"));
    QVERIFY(figure && prop);
    figure->findBone(QStringLiteral("B_UpperArm_Left"))->getZRotate()->setValue(-35.0f);
    figure->findBone(QStringLiteral("B_Spine2"))->getXRotate()->setValue(20.0f);
    morphsOf(prop).value(1)->setValue(0.6f);
    const QVector<RkVec3> figureBefore = deformed(figure);
    const QVector<RkVec3> propBefore = deformed(prop);
    const int nodes = rkScene->getNumNodes();

    // Saved beside its models, the scene stores them relative: it opens from a copy elsewhere.
    QVERIFY(rkScene->save(dir.filePath("scene.rks")));
    rkScene->clear();
    QTemporaryDir moved;
    for (const QString& f : QDir(dir.path()).entryList(QDir::Files))
        QVERIFY(QFile::copy(dir.filePath(f), moved.filePath(f)));
    QVERIFY(QDir(dir.path()).removeRecursively());
    QString error;
    QVERIFY2(rkScene->load(moved.filePath("scene.rks"), &error), qPrintable(error));
    QVERIFY(RkImporter::takeSourceProblems().isEmpty());

    QCOMPARE(rkScene->getNumNodes(), nodes);
    figure = qobject_cast<RkSkeleton*>(rkScene->findNode(QStringLiteral("figure")));
    prop = rkScene->findNode(QStringLiteral("AnimatedMorphCube"));
    QVERIFY(figure && prop);
    QCOMPARE(figure->findBone(QStringLiteral("B_UpperArm_Left"))->getZRotate()->getValue(), -35.0f);
    QCOMPARE(morphsOf(prop).size(), 2);
    QCOMPARE(morphsOf(prop).value(1)->getValue(), 0.6f);
    QVERIFY(sameVertices(deformed(figure), figureBefore));
    QVERIFY(sameVertices(deformed(prop), propBefore));
    QVERIFY(figure->getSource().startsWith(QStringLiteral("file:") + moved.path()));
}

void TestRkImporter::missingOrChangedSource()
{
    QTemporaryDir dir;
    const QString cube = model("glTF2/glTF-Sample-Models/AnimatedMorphCube-glTF/");
    REQUIRE_MODEL(cube + "AnimatedMorphCube.gltf");
    QVERIFY(QFile::copy(cube + "AnimatedMorphCube.gltf", dir.filePath("cube.gltf")));
    QVERIFY(QFile::copy(cube + "AnimatedMorphCube.bin", dir.filePath("AnimatedMorphCube.bin")));
    RkNode* node = importInto(dir.filePath("cube.gltf"));
    QVERIFY(node);
    morphsOf(node).value(0)->setValue(0.25f);
    QVERIFY(rkScene->save(dir.filePath("scene.rks")));

    // Missing: the scene opens, the node is there without geometry, and the user hears which file.
    QVERIFY(QFile::rename(dir.filePath("cube.gltf"), dir.filePath("elsewhere.gltf")));
    QVERIFY(rkScene->load(dir.filePath("scene.rks")));
    node = rkScene->findNode(QStringLiteral("cube"));
    QVERIFY(node);
    QVERIFY(!node->getObject());
    QCOMPARE(morphsOf(node).value(0)->getValue(), 0.25f);
    QStringList problems = RkImporter::takeSourceProblems();
    QCOMPARE(problems.size(), 1);
    QVERIFY2(problems[0].contains(QLatin1String("cube.gltf")) &&
                 problems[0].contains(QLatin1String("missing")),
             qPrintable(problems[0]));

    // Replaced by a different model: not taken for the old one.
    QVERIFY(QFile::copy(model("OBJ/box.obj"), dir.filePath("cube.gltf")));
    QVERIFY(rkScene->load(dir.filePath("scene.rks")));
    QVERIFY(!rkScene->findNode(QStringLiteral("cube"))->getObject());
    problems = RkImporter::takeSourceProblems();
    QCOMPARE(problems.size(), 1);
    QVERIFY2(problems[0].contains(QLatin1String("changed")), qPrintable(problems[0]));

    // Back as it was: rebuilt.
    QVERIFY(QFile::remove(dir.filePath("cube.gltf")));
    QVERIFY(QFile::rename(dir.filePath("elsewhere.gltf"), dir.filePath("cube.gltf")));
    QVERIFY(rkScene->load(dir.filePath("scene.rks")));
    QVERIFY(rkScene->findNode(QStringLiteral("cube"))->getObject());
    QVERIFY(RkImporter::takeSourceProblems().isEmpty());
}

void TestRkImporter::badFiles_data()
{
    QTest::addColumn<QByteArray>("content");
    QTest::addColumn<QString>("suffix");
    QTest::addColumn<bool>("refused");
    QTest::addColumn<QString>("message");
    QTest::newRow("empty") << QByteArray() << "obj" << true << "could not be imported";
    QTest::newRow("unknown format")
        << QByteArray("hello\n") << "xyz" << true << "could not be imported";
    QTest::newRow("no surface") << QByteArray("v 0 0 0\nv 1 0 0\n") << "obj" << true
                                << "could not be imported";
    QTest::newRow("index out of range")
        << QByteArray("v 0 0 0\nv 1 0 0\nv 0 1 0\nf 1 2 3\nf 1 2 9\n") << "obj" << true
        << "index out of range";
    QTest::newRow("NaN position") << QByteArray(
                                         "v 0 0 0\nv 1 0 0\nv 0 1 0\nv nan 0 0\nf 1 2 3\nf 1 3 4\n")
                                  << "obj" << false << "vertices without a valid position";
    // glTF allows a skin without bind matrices, but the reader crashes on it.
    QTest::newRow("skinned to 12 joints") << skinnedGltf(12) << "gltf" << false << QString();
    QTest::newRow("skin without bind matrices")
        << skinnedGltf(12, false) << "gltf" << true << "no inverse bind matrices";
    QTest::newRow("polygon") << QByteArray("v 0 0 0\nv 1 0 0\nv 1 1 0\nv 0.5 1.5 0\nv 0 1 0\n"
                                           "f 1 2 3 4 5\n")
                             << "obj" << false << QString();
}

void TestRkImporter::badFiles()
{
    QFETCH(QByteArray, content);
    QFETCH(QString, suffix);
    QFETCH(bool, refused);
    QFETCH(QString, message);
    QTemporaryDir dir;
    const QString path = dir.filePath("bad." + suffix);
    QFile f(path);
    QVERIFY(f.open(QIODevice::WriteOnly));
    f.write(content);
    f.close();
    importInto(model("OBJ/box.obj"));
    const QStringList before = sceneState();

    RkImporter importer;
    const bool ok = importer.read(path);
    QVERIFY2(!ok == refused, qPrintable(importer.errorString()));
    if (refused) {
        QVERIFY2(importer.errorString().contains(message), qPrintable(importer.errorString()));
        QVERIFY(importer.errorString().contains(QLatin1String("bad.") + suffix));
        QVERIFY(!importer.addToScene(rkScene));
        QCOMPARE(sceneState(), before);
        return;
    }
    if (!message.isEmpty())
        QVERIFY2(importer.warnings().join(' ').contains(message),
                 qPrintable(importer.warnings().join(' ')));
    RkNode* node = importer.addToScene(rkScene);
    QVERIFY(node && node->getObject());
    const RkGeometry* g = node->getObject()->getGeometry();
    QVERIFY(g->getNumFacets() > 0);
    for (int f = 0; f < g->getNumFacets(); ++f)
        QVERIFY(g->getFacetSize(f) == 3 || g->getFacetSize(f) == 4);
    for (const RkVec3& v : deformed(node))
        QVERIFY(std::isfinite(v.x) && std::isfinite(v.y) && std::isfinite(v.z));
}

void TestRkImporter::mutatedFiles()
{
    const QString path = model("glTF2/BoxTextured-glTF-Binary/BoxTextured.glb");
    REQUIRE_MODEL(path);
    QFile f(path);
    QVERIFY(f.open(QIODevice::ReadOnly));
    const QByteArray original = f.readAll();
    importInto(model("OBJ/box.obj"));
    QTemporaryDir dir;
    QRandomGenerator random(1234);
    int refused = 0;
    for (int i = 0; i < 200; ++i) {
        QByteArray bytes = original;
        if (i % 2 == 0) {
            bytes.truncate(int(random.bounded(bytes.size())));
        } else {
            for (int flips = 1 + int(random.bounded(8)); flips > 0; --flips)
                bytes.data()[random.bounded(bytes.size())] ^= char(1 << random.bounded(8));
        }
        const QString copy = dir.filePath(QStringLiteral("m%1.glb").arg(i));
        QFile out(copy);
        QVERIFY(out.open(QIODevice::WriteOnly));
        out.write(bytes);
        out.close();

        const QStringList before = sceneState();
        RkImporter importer;
        if (!importer.read(copy)) {
            ++refused;
            QVERIFY(!importer.errorString().isEmpty());
            QCOMPARE(sceneState(), before);
            continue;
        }
        RkNode* node = importer.addToScene(rkScene);
        QVERIFY(node && node->getObject());
        QCOMPARE(rkScene->getNumNodes(), before.size() + 1);
        for (const RkVec3& v : deformed(node))
            QVERIFY(std::isfinite(v.x) && std::isfinite(v.y) && std::isfinite(v.z));
        rkScene->removeNode(node);
    }
    // Truncation alone refuses most of them.
    QVERIFY(refused >= 100);
}

RK_TEST_MAIN(TestRkImporter)

#include "tst_rkimporter.moc"
