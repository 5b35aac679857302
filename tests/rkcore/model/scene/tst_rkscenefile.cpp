#include "app/rkapp.h"
#include "demo/rkdemoscene.h"
#include "io/rkinfile.h"
#include "io/rkoutfile.h"
#include "plugin/rkpluginmgr.h"
#include "properties/rkboolproperty.h"
#include "properties/rkfloatproperty.h"
#include "properties/rkintproperty.h"
#include "rktestfactory.h"
#include "rktestmain.h"
#include "scene/rkbone.h"
#include "scene/rkcamera.h"
#include "scene/rkelementdata.h"
#include "scene/rkscene.h"
#include "scene/rkscenefile.h"
#include "scene/rkskeleton.h"

#include <QPointer>
#include <QRandomGenerator>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QtEndian>

#include <functional>

namespace
{

int livingParts = 0;
int livingData = 0;

template <typename T> T* assertCast(RkBase* object)
{
    if (!object)
        return nullptr;
    if (auto* cast = qobject_cast<T*>(object))
        return cast;
    throw QStringLiteral("Failure to cast RkAssertCast");
}

// A stored object owned by TestData: a number and a pointer to a morph.
class TestPart : public RkBase
{
    Q_OBJECT
public:
    TestPart() { ++livingParts; }
    ~TestPart() override { --livingParts; }
    int number = 0;
    QPointer<RkFloatProperty> morph;

    void save(RkOutFile* file) const override
    {
        file->startSection(0x301);
        file->writeInt(number);
        file->writePointer(morph, 0);
        file->endSection();
    }
    void loadSection(RkInFile* file, short id) override
    {
        if (id != 0x301)
            return RkBase::loadSection(file, id);
        file->readInt(number);
        file->readPointer();
    }
    void setPointer(const RkInFile*, short, short, RkBase* object) override
    {
        morph = assertCast<RkFloatProperty>(object);
    }
};

// Element data holding owned parts, a pointer to another node, a note and raw bytes.
class TestData : public RkElementData
{
    Q_OBJECT
public:
    TestData() : RkElementData(QStringLiteral("TestData"), true) { ++livingData; }
    ~TestData() override
    {
        qDeleteAll(parts);
        --livingData;
    }
    QVector<TestPart*> parts;
    QPointer<RkNode> buddy;
    QString note;
    QByteArray blob;

    void save(RkOutFile* file) const override
    {
        file->startSection(0x300);
        for (int i = 0; i < parts.size(); ++i)
            file->writePointer(parts.at(i), short(i));
        file->endSection();
        file->writePointerSection(0x302, buddy, 0);
        file->writeByteArraySection(0x303, blob);
        file->startSection(0x304);
        file->writeString(note);
        file->endSection();
    }
    void loadSection(RkInFile* file, short id) override
    {
        switch (id) {
        case 0x300:
            while (file->readPointer() == 0) {
            }
            break;
        case 0x302:
            file->readPointer();
            break;
        case 0x303:
            blob = file->readByteArray();
            break;
        case 0x304:
            file->readString(note);
            break;
        default:
            RkElementData::loadSection(file, id);
        }
    }
    void setPointer(const RkInFile*, short id, short, RkBase* object) override
    {
        if (id == 0x300)
            parts.append(assertCast<TestPart>(object));
        else if (id == 0x302)
            buddy = assertCast<RkNode>(object);
    }
};

const char* const PartGuid = "0b7d4c1e-2f4a-4b8e-9c31-5a6e7f809101";
const char* const DataGuid = "0b7d4c1e-2f4a-4b8e-9c31-5a6e7f809102";
const char* const NodeGuid = "7d2b8f10-3c41-4e8a-9a51-0f6c2d7e1a01";

// Everything a user could see of the scene, as text.
QString sceneText()
{
    QStringList out;
    for (RkNode* n : rkScene->getNodes()) {
        out << QStringLiteral("%1 %2 \"%3\" parent=%4 source=%5 origin=%6,%7,%8")
                   .arg(n->className(), n->getName(), n->getLabel(),
                        n->getNodeParent() ? n->getNodeParent()->getName() : "-", n->getSource())
                   .arg(n->getOrigin().x())
                   .arg(n->getOrigin().y())
                   .arg(n->getOrigin().z());
        for (RkProperty* p : n->getProperties()) {
            QString memorized = QStringLiteral("-");
            if (auto* f = qobject_cast<RkFloatProperty*>(p))
                memorized = QString::number(double(f->getMemorizedValue()));
            else if (auto* i = qobject_cast<RkIntProperty*>(p))
                memorized = QString::number(i->getMemorizedValue());
            out << QStringLiteral("  %1 %2 \"%3\" %4 flags=%5 value=%6 memorized=%7")
                       .arg(p->className(), p->getName(), p->getLabel(), p->getPath())
                       .arg(p->getFlags())
                       .arg(p->getValueVariant().toString(), memorized);
        }
        for (RkElementData* item : n->getDataItems()) {
            auto* data = qobject_cast<TestData*>(item);
            QStringList parts;
            for (TestPart* part : data ? data->parts : QVector<TestPart*>())
                parts << QStringLiteral("%1->%2")
                             .arg(part->number)
                             .arg(part->morph ? part->morph->getName() : "null");
            out << QStringLiteral("  data %1 buddy=%2 note=%3 blob=%4 parts=%5")
                       .arg(item->getName(), data && data->buddy ? data->buddy->getName() : "null",
                            data ? data->note : "", data ? QString(data->blob.toHex()) : "",
                            parts.join(","));
        }
    }
    return out.join('\n');
}

// Builds scene files by hand, for input the writer would never make.
struct FileBuilder {
    struct Object {
        QString guid, cls, name;
        QList<QPair<short, QByteArray>> sections;
    };
    QList<Object> objects;

    template <typename T> static void put(QByteArray& b, T v)
    {
        char buf[sizeof(T)];
        qToLittleEndian(v, buf);
        b.append(buf, int(sizeof(T)));
    }
    static void putString(QByteArray& b, const QString& s)
    {
        put<quint32>(b, quint32(s.toUtf8().size()));
        b.append(s.toUtf8());
    }
    static QByteArray intValue(int v)
    {
        QByteArray b(1, char(1));
        put<qint32>(b, v);
        return b;
    }
    static QByteArray stringValue(const QString& s)
    {
        QByteArray b(1, char(5));
        putString(b, s);
        return b;
    }
    static QByteArray floatValue(float v)
    {
        QByteArray b(1, char(2));
        quint32 bits;
        memcpy(&bits, &v, 4);
        put<quint32>(b, bits);
        return b;
    }
    static QByteArray pointer(quint8 kind, qint32 target, const QString& property = QString())
    {
        QByteArray b(1, char(7));
        b.append(char(kind));
        put<qint16>(b, 0);
        put<qint32>(b, target);
        if (kind == 2)
            putString(b, property);
        return b;
    }
    Object& add(const QString& guid, const QString& cls, const QString& name)
    {
        objects.append(Object{guid, cls, name, {}});
        return objects.last();
    }
    QByteArray bytes(int lengthSkew = 0) const
    {
        QByteArray body;
        for (const Object& o : objects) {
            QByteArray rec;
            putString(rec, o.guid);
            putString(rec, o.cls);
            putString(rec, o.name);
            put<quint32>(rec, quint32(o.sections.size()));
            for (const auto& s : o.sections) {
                put<qint16>(rec, s.first);
                put<quint32>(rec, quint32(s.second.size() + lengthSkew));
                rec.append(s.second);
            }
            put<quint32>(body, quint32(rec.size()));
            body.append(rec);
        }
        return withHeader(body, objects.size());
    }
    static QByteArray withHeader(const QByteArray& body, int count)
    {
        QByteArray f("RKSCENE\x1a", 8);
        put<quint32>(f, 1);
        put<quint32>(f, quint32(count));
        put<quint32>(f, quint32(body.size()));
        put<quint32>(f, crc(body));
        return f + body;
    }
    static quint32 crc(const QByteArray& data)
    {
        quint32 c = 0xFFFFFFFFu;
        for (char ch : data) {
            c ^= quint8(ch);
            for (int k = 0; k < 8; ++k)
                c = (c & 1) ? 0xEDB88320u ^ (c >> 1) : c >> 1;
        }
        return c ^ 0xFFFFFFFFu;
    }
    // Makes the checksum right again after a change to the body.
    static void fixChecksum(QByteArray& file)
    {
        if (file.size() < 24)
            return;
        qToLittleEndian<quint32>(quint32(file.size() - 24), file.data() + 16);
        qToLittleEndian<quint32>(crc(file.mid(24)), file.data() + 20);
    }
};

} // namespace

class TestRkSceneFile : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void init();
    void roundTripKeepsEverything();
    void badInputLeavesTheSceneAlone_data();
    void badInputLeavesTheSceneAlone();
    void mutatedFilesNeverHurt();
    void saveReplacesTheFileWhole();

private:
    // The demo scene with changed values and flags, and test data on the figure.
    void buildScene();
    QString writeScene();
    QTemporaryDir dir;
};

void TestRkSceneFile::initTestCase()
{
    static RkTestFactory<TestPart> partFactory(PartGuid);
    static RkTestFactory<TestData> dataFactory(DataGuid);
    QVERIFY(rkApp->getPluginMgr()->addClassFactory(&partFactory));
    QVERIFY(rkApp->getPluginMgr()->addClassFactory(&dataFactory));
    QVERIFY(dir.isValid());
}

void TestRkSceneFile::init()
{
    rkScene->clear();
    QCOMPARE(livingParts, 0);
    QCOMPARE(livingData, 0);
}

void TestRkSceneFile::buildScene()
{
    RkSkeleton* figure = rkBuildDemoScene(rkScene);
    auto* smile = qobject_cast<RkFloatProperty*>(figure->findProperty("Smile"));
    auto* ears = qobject_cast<RkFloatProperty*>(figure->findProperty("EarsLarge"));
    smile->setValue(0.75f);
    smile->setIsFavorite(true);
    ears->setIsGlobalFavorite(true);
    ears->setHidden(true);
    ears->setLabel("Big Ears");
    // Locked after its change: loading must still restore the value.
    ears->setValue(0.4f);
    ears->setLocked(true);
    smile->setMemorizedValue(0.25f);
    figure->findBone("lShldr")->getZRotate()->setValue(-35.5f);
    auto* level = qobject_cast<RkIntProperty*>(figure->findProperty("SubdivisionLevel"));
    level->setValue(2);
    level->setMemorizedValue(1);
    qobject_cast<RkBoolProperty*>(figure->findProperty("CastShadows"))->setValue(false);

    // A property only the file knows about.
    RkNode* prop = rkScene->findNode(RkDemoPropName);
    auto* spin = new RkFloatProperty("Spin", "Spin Speed");
    spin->setMinMax(-5, 5);
    spin->setValue(2.5f);
    prop->addProperty(spin, "Custom/Motion");

    auto* data = new TestData;
    data->note = QString::fromUtf8("h\xc3\xa9llo");
    data->blob = QByteArray("\x00\x01\xff png", 8);
    data->buddy = rkScene->findNode(RkDemoCameraName);
    for (int i = 0; i < 2; ++i) {
        auto* part = new TestPart;
        part->number = 10 + i;
        part->morph = i == 0 ? smile : ears;
        data->parts.append(part);
    }
    data->parts.append(new TestPart); // a part whose morph is gone is stored as null
    figure->addDataItem(data);
}

QString TestRkSceneFile::writeScene()
{
    const QString path = dir.filePath("scene.rks");
    QString error;
    if (!rkScene->save(path, &error))
        qWarning("%s", qPrintable(error));
    return path;
}

void TestRkSceneFile::roundTripKeepsEverything()
{
    buildScene();
    const QString before = sceneText();
    const QString path = writeScene();

    rkScene->clear();
    QCOMPARE(rkScene->getNumNodes(), 0);
    QStringList events;
    QObject guard;
    for (auto [signal, name] : {std::make_pair(&RkScene::sceneClearStarting, "clearStarting"),
                                std::make_pair(&RkScene::sceneCleared, "cleared"),
                                std::make_pair(&RkScene::sceneLoadStarting, "loadStarting"),
                                std::make_pair(&RkScene::sceneLoaded, "loaded")}) {
        const QString n = name;
        connect(rkScene, signal, &guard, [&events, n] { events << n; });
    }
    QString error;
    QVERIFY2(rkScene->load(path, &error), qPrintable(error));
    QCOMPARE(events, QStringList({"clearStarting", "cleared", "loadStarting", "loaded"}));
    QCOMPARE(sceneText(), before);

    // Pointers lead to the loaded objects, not to look-alikes.
    auto* figure = qobject_cast<RkSkeleton*>(rkScene->findNode(RkDemoFigureName));
    QVERIFY(figure);
    auto* data = qobject_cast<TestData*>(figure->findDataItem("TestData"));
    QVERIFY(data);
    QCOMPARE(data->parts.size(), 3);
    QCOMPARE(data->parts.at(0)->morph.data(), figure->findProperty("Smile"));
    QCOMPARE(data->parts.at(2)->morph.data(), nullptr);
    QCOMPARE(data->buddy.data(), rkScene->findNode(RkDemoCameraName));
    QCOMPARE(figure->findBone("head")->getSkeleton(), figure);
    QList<RkBone*> bones;
    figure->getAllBones(bones);
    QCOMPARE(bones.size(), rkDemoBones().size());
    QCOMPARE(rkScene->getFileName(), path);

    // Loading over a scene replaces it and does not leak what was there.
    QVERIFY2(rkScene->load(path, &error), qPrintable(error));
    QCOMPARE(sceneText(), before);
    QCOMPARE(livingData, 1);
    QCOMPARE(livingParts, 3);
}

void TestRkSceneFile::badInputLeavesTheSceneAlone_data()
{
    QTest::addColumn<QByteArray>("file");
    QTest::addColumn<QString>("message");

    auto node = [](FileBuilder& b) -> FileBuilder::Object& {
        return b.add(NodeGuid, "RkNode", "n");
    };
    auto withData = [&](const QList<QPair<short, QByteArray>>& dataSections,
                        const QByteArray& nodeItems) {
        FileBuilder b;
        node(b).sections = {{0x120, nodeItems}};
        b.add(DataGuid, "TestData", "TestData").sections = dataSections;
        return b;
    };
    const QByteArray itemPointer = FileBuilder::pointer(1, 1);

    QTest::newRow("empty") << QByteArray() << "too short";
    QTest::newRow("not a scene") << QByteArray(40, 'x') << "not a scene file";
    {
        FileBuilder b;
        node(b);
        QByteArray f = b.bytes();
        qToLittleEndian<quint32>(7, f.data() + 8);
        QTest::newRow("newer format") << f << "format version 7";
        QTest::newRow("truncated") << b.bytes().left(b.bytes().size() - 3) << "truncated";
        QTest::newRow("trailing bytes") << b.bytes() + "zz"
                                        << "after its end";
        QByteArray flipped = b.bytes();
        flipped[30] = char(flipped[30] ^ 0x20);
        QTest::newRow("damaged") << flipped << "checksum";
        QByteArray many = b.bytes();
        qToLittleEndian<quint32>(100000, many.data() + 12);
        QTest::newRow("object count") << many << "objects";
    }
    {
        FileBuilder b;
        b.add("01234567-89ab-cdef-0123-456789abcdef", "RkMystery", "m");
        QTest::newRow("unknown GUID") << b.bytes() << "no class is known by the GUID";
    }
    {
        FileBuilder b;
        node(b).sections = {{0x0101, FileBuilder::intValue(3)}};
        QTest::newRow("section length") << b.bytes(5) << "runs past";
        QTest::newRow("wrong value type") << b.bytes() << "holds an int where a string belongs";
        b.objects.last().sections = {{0x7777, QByteArray()}};
        QTest::newRow("unknown section") << b.bytes() << "does not know section 0x7777";
        b.objects.last().sections = {{0x0101, FileBuilder::stringValue("label") +
                                                  FileBuilder::stringValue("") +
                                                  FileBuilder::floatValue(qQNaN())}};
        QTest::newRow("NaN value") << b.bytes() << "not a number";
    }
    QTest::newRow("missing index")
        << withData({{0x300, FileBuilder::pointer(1, 9)}}, itemPointer).bytes()
        << "refers to object 9";
    QTest::newRow("wrong class")
        << withData({{0x300, FileBuilder::pointer(1, 0)}}, itemPointer).bytes()
        << "Failure to cast RkAssertCast";
    {
        FileBuilder b = withData({{0x300, FileBuilder::pointer(1, 2)}}, itemPointer);
        b.add(PartGuid, "TestPart", "").sections = {
            {0x301, FileBuilder::intValue(1) + FileBuilder::pointer(2, 0, "NoSuchMorph")}};
        QTest::newRow("missing property") << b.bytes() << "does not have";
    }
    {
        FileBuilder b = withData({{0x300, FileBuilder::pointer(1, 2) + FileBuilder::pointer(1, 2)}},
                                 itemPointer);
        b.add(PartGuid, "TestPart", "").sections = {
            {0x301, FileBuilder::intValue(1) + FileBuilder::pointer(0, -1)}};
        QTest::newRow("pointed at twice") << b.bytes() << "more than once";
    }
    {
        FileBuilder b = withData({{0x300, FileBuilder::pointer(1, 2)}}, itemPointer);
        b.add(PartGuid, "TestPart", "").sections = {
            {0x301, FileBuilder::intValue(1) + FileBuilder::floatValue(qQNaN())}};
        QTest::newRow("float for a pointer") << b.bytes() << "where a pointer belongs";
    }
    for (int step : {-1, 1}) {
        // A chain of nodes deeper than any rig, linked upwards and downwards.
        FileBuilder b;
        const int count = RkNode::MaxHierarchyDepth + 10;
        for (int i = 0; i < count; ++i) {
            const int parent = i + step;
            node(b).sections = {
                {0x0102, FileBuilder::pointer(parent < 0 || parent >= count ? 0 : 1, parent)}};
        }
        QTest::newRow(step < 0 ? "deep hierarchy" : "deep hierarchy, forward")
            << b.bytes() << "deeper than";
    }
    {
        // A node whose parent is itself.
        FileBuilder b;
        node(b).sections = {{0x0102, FileBuilder::pointer(1, 0)}};
        QTest::newRow("own parent") << b.bytes() << "own parent";
    }
}

void TestRkSceneFile::badInputLeavesTheSceneAlone()
{
    QFETCH(QByteArray, file);
    QFETCH(QString, message);
    buildScene();
    rkScene->selectNode(rkScene->findNode(RkDemoPropName));
    const QString before = sceneText();
    const int parts = livingParts;
    const QString path = dir.filePath("bad.rks");
    QFile f(path);
    QVERIFY(f.open(QIODevice::WriteOnly));
    f.write(file);
    f.close();

    QSignalSpy loadStarting(rkScene, &RkScene::sceneLoadStarting);
    QSignalSpy clearStarting(rkScene, &RkScene::sceneClearStarting);
    QString error;
    QVERIFY(!rkScene->load(path, &error));
    QVERIFY2(error.contains(message), qPrintable(error));
    QCOMPARE(sceneText(), before);
    QCOMPARE(rkScene->getPrimarySelection(), rkScene->findNode(RkDemoPropName));
    QCOMPARE(loadStarting.count(), 0);
    QCOMPARE(clearStarting.count(), 0);
    QCOMPARE(livingParts, parts);
    QCOMPARE(livingData, 1);
}

void TestRkSceneFile::mutatedFilesNeverHurt()
{
    buildScene();
    const QString path = writeScene();
    QFile original(path);
    QVERIFY(original.open(QIODevice::ReadOnly));
    const QByteArray good = original.readAll();
    original.close();
    const QString before = sceneText();
    QRandomGenerator rng(20261206);
    int failed = 0;
    const int rounds = 400;
    for (int round = 0; round < rounds; ++round) {
        QByteArray bad = good;
        const int kind = round % 4;
        if (kind == 0) {
            bad.truncate(int(rng.bounded(bad.size())));
        } else if (kind == 1) {
            const int at = int(rng.bounded(bad.size()));
            bad[at] = char(bad[at] ^ (1 << rng.bounded(8)));
        } else {
            // A changed length or count field (or whatever sits there), with the checksum made
            // right again so the structure checks have to catch it.
            const int at = 24 + int(rng.bounded(bad.size() - 28));
            const quint32 v = qFromLittleEndian<quint32>(bad.constData() + at);
            const qint32 delta = kind == 2 ? qint32(rng.bounded(9)) - 4 : qint32(rng.generate());
            qToLittleEndian<quint32>(v + quint32(delta), bad.data() + at);
            FileBuilder::fixChecksum(bad);
        }
        RkSceneReader reader;
        if (reader.read(bad)) {
            // Rare, but allowed: the change hit a value. Whatever loaded must be whole.
            for (RkNode* n : reader.takeNodes())
                delete n;
            continue;
        }
        ++failed;
        QVERIFY(!reader.errorString().isEmpty());
    }
    QVERIFY(failed > rounds / 2);
    QCOMPARE(sceneText(), before);

    // Through the scene as well, for a few of them.
    for (int cut : {10, 100, 1000, good.size() - 1}) {
        QFile f(path);
        QVERIFY(f.open(QIODevice::WriteOnly));
        f.write(good.left(cut));
        f.close();
        QString error;
        QVERIFY(!rkScene->load(path, &error));
        QCOMPARE(sceneText(), before);
    }
}

void TestRkSceneFile::saveReplacesTheFileWhole()
{
    buildScene();
    const QString path = writeScene();
    QFile f(path);
    QVERIFY(f.open(QIODevice::ReadOnly));
    const QByteArray good = f.readAll();
    f.close();

    // An object of a class with no factory cannot be stored: the save fails and the old file
    // stays as it was.
    class Unstorable : public RkElementData
    {
    public:
        Unstorable() : RkElementData("Unstorable", true) {}
    };
    rkScene->findNode(RkDemoPropName)->addDataItem(new Unstorable);
    QString error;
    QVERIFY(!rkScene->save(path, &error));
    QVERIFY2(error.contains("cannot be stored"), qPrintable(error));
    QVERIFY(f.open(QIODevice::ReadOnly));
    QCOMPARE(f.readAll(), good);
}

RK_TEST_MAIN(TestRkSceneFile)
#include "tst_rkscenefile.moc"
