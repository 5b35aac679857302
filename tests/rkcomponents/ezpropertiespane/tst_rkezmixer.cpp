#include "rkezmixer.h"
#include "rkezmixercontrol.h"
#include "rkezmixerdriver.h"
#include "rkezmixers.h"
#include "rkezmixersolver.h"

#include "rkapp.h"
#include "rkclassfactory.h"
#include "rkcomponentsplugin.h"
#include "rkfloatproperty.h"
#include "rkoutfile.h"
#include "rkplugin.h"
#include "rkpluginmgr.h"
#include "rkscene.h"
#include "rkskeleton.h"
#include "rkstoredclasses.h"
#include "rktestmain.h"
#include "rkundostack.h"

#include <QPainter>
#include <QPointer>
#include <QTemporaryDir>

#include <cmath>
#include <memory>

namespace {

// A figure with morphs "Morph 0" .. "Morph n-1", all at 0.25 and clamped to [0, 1].
RkSkeleton* makeFigure(int morphs)
{
    auto* figure = new RkSkeleton;
    figure->setName(QStringLiteral("Figure"));
    figure->setLabel(QStringLiteral("Figure"));
    for (int i = 0; i < morphs; ++i) {
        auto* morph = new RkFloatProperty(QString("Morph %1").arg(i), QString("Morph %1").arg(i));
        morph->setMinMax(0.f, 1.f);
        morph->setClamped(true);
        morph->setValue(0.25f);
        figure->addProperty(morph, QStringLiteral("Morphs"));
    }
    return figure;
}

RkFloatProperty* morph(RkNode* figure, int i)
{
    return qobject_cast<RkFloatProperty*>(figure->findProperty(QString("Morph %1").arg(i)));
}

// A thumbnail with a pattern of its own and transparent corners.
QImage thumbnail(int seed)
{
    QImage image(85, 85, QImage::Format_ARGB32);
    image.fill(Qt::transparent);
    QPainter painter(&image);
    painter.setPen(Qt::NoPen);
    painter.setBrush(QColor::fromHsv(seed * 37 % 360, 200, 220));
    painter.drawEllipse(QRect(4, 4, 77, 77));
    painter.setBrush(QColor(seed * 20 % 256, 40, 90, 128));
    painter.drawRect(20 + seed % 30, 30, 25, 20);
    return image;
}

RkEzMixer* makeMixer(RkNode* figure, const QVector<QPoint>& points, const QVector<float>& values,
                     int firstMorph = 0)
{
    auto* mixer = new RkEzMixer;
    for (int i = 0; i < points.size(); ++i) {
        auto* control = new RkEzMixerControl;
        control->setControlProperty(morph(figure, firstMorph + i));
        if (i < values.size())
            control->setValue(values[i]);
        control->setImage(thumbnail(firstMorph + i));
        control->setX(points[i].x());
        control->setY(points[i].y());
        mixer->addControl(control);
    }
    return mixer;
}

QVector<float> morphValues(RkNode* figure, int count, int firstMorph = 0)
{
    QVector<float> values;
    for (int i = 0; i < count; ++i)
        values.append(morph(figure, firstMorph + i)->getValue());
    return values;
}

bool fuzzyEqual(const QVector<float>& a, const QVector<float>& b, float tolerance = 1e-4f)
{
    if (a.size() != b.size())
        return false;
    for (int i = 0; i < a.size(); ++i) {
        if (!(std::fabs(a[i] - b[i]) <= tolerance))
            return false;
    }
    return true;
}

QString toString(const QVector<float>& values)
{
    QStringList list;
    for (float v : values)
        list << QString::number(v);
    return list.join(QStringLiteral(", "));
}

// Stand-ins that store one pointer list under a mixer section id but point at objects of the
// wrong class. They are stored under GUIDs that load back as the real mixer classes, which then
// meet the wrong objects.
class OuterImpostor : public RkElementData {
    Q_OBJECT
public:
    OuterImpostor(short section, RkBase* target)
        : RkElementData(QStringLiteral("RkEzMixers")), m_section(section), m_target(target)
    {
        target->setParent(this);
    }
    void save(RkOutFile* file) const override
    {
        file->startSection(m_section);
        file->writePointer(m_target, 0);
        file->endSection();
    }

private:
    short m_section;
    RkBase* m_target;
};

class InnerImpostor : public RkBase {
    Q_OBJECT
public:
    InnerImpostor(short section, RkBase* target) : m_section(section), m_target(target)
    {
        target->setParent(this);
    }
    void save(RkOutFile* file) const override
    {
        file->startSection(m_section);
        file->writePointer(m_target, 0);
        file->endSection();
    }

private:
    short m_section;
    RkBase* m_target;
};

const QVector<QPoint> kSlots = {{105, 42}, {168, 127}, {105, 212}, {42, 127},
                                {149, 66}, {149, 187}, {60, 187},  {60, 66}};

} // namespace

class TestRkEzMixer : public QObject {
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void cleanup();
    void factories();
    void drive_data();
    void drive();
    void controlsOnOnePointLeaveValues();
    void dragIsOneUndoEntry();
    void deletedPropertyIsSkipped();
    void removalTakesOutAtOnceAndDeletesLater();
    void saveClearLoadRoundTrip();
    void wrongClassFailsLoad_data();
    void wrongClassFailsLoad();
};

// The host makes stored mixers through the module's class factories.
void TestRkEzMixer::initTestCase()
{
    QVERIFY(rkApp->getPluginMgr()->addPlugin(rkComponentsPlugin()));
}

void TestRkEzMixer::cleanup()
{
    rkScene->clear();
    rkUndoStack->clear();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

// Stored scenes name these classes by GUID, so the GUIDs, the classes they make and their order
// in the module's table must hold.
void TestRkEzMixer::factories()
{
    const QList<QPair<QString, QString>> expected = {
        {"RkEzMixers", "eb3b80e0-bdb1-11de-98b0-0002a5d5c51b"},
        {"RkEzMixer", "19054e20-bdb2-11de-a0a6-0002a5d5c51b"},
        {"RkEzMixerControl", "1f6c1960-bdb2-11de-af02-0002a5d5c51b"},
        {"RkEzMixerDriver", "2578ddc0-bdb2-11de-81d0-0002a5d5c51b"},
    };
    const QList<RkClassFactory*>& factories = rkComponentsPlugin()->getClassFactories();
    int previous = -1;
    for (const auto& [className, guid] : expected) {
        int row = -1;
        for (int i = 0; i < factories.size(); ++i) {
            if (factories[i]->className() == className)
                row = i;
        }
        QVERIFY2(row > previous, qPrintable(className));
        previous = row;
        RkClassFactory* factory = factories[row];
        QCOMPARE(factory->getGUID().toString(), guid);
        QCOMPARE(rkApp->getPluginMgr()->findClassFactory(RkGUID::fromString(guid)), factory);
        std::unique_ptr<QObject> object(factory->createInstance());
        QVERIFY(object);
        QCOMPARE(QString(object->metaObject()->className()), className);
        QVERIFY(qobject_cast<RkBase*>(object.get()));
    }
    QCOMPARE(factories.last()->className(), QStringLiteral("RkFullScreenAction"));

    std::unique_ptr<QObject> made(
        rkApp->getPluginMgr()->findClassFactory(QStringLiteral("RkEzMixers"))->createInstance());
    auto* mixers = qobject_cast<RkEzMixers*>(made.get());
    QVERIFY(mixers);
    QCOMPARE(mixers->getName(), QStringLiteral("RkEzMixers"));
    QVERIFY(mixers->isPersistent());
}

void TestRkEzMixer::drive_data()
{
    QTest::addColumn<QVector<QPoint>>("points");
    QTest::addColumn<QVector<float>>("values");
    QTest::addColumn<QPoint>("driver");
    QTest::addColumn<QVector<float>>("expected");

    const QVector<QPoint> pair = {{40, 100}, {140, 100}};
    QTest::newRow("pair, on control 0") << pair << QVector<float>{1.f, 0.5f} << QPoint(40, 100)
                                        << QVector<float>{1.f, 0.f};
    QTest::newRow("pair, halfway") << pair << QVector<float>{1.f, 0.5f} << QPoint(90, 100)
                                   << QVector<float>{0.5f, 0.25f};
    // Weights are not clamped, and the plain setter stores values outside the morph's limits.
    QTest::newRow("pair, beyond control 1") << pair << QVector<float>{1.f, 0.5f} << QPoint(190, 40)
                                            << QVector<float>{-0.5f, 0.75f};
    QTest::newRow("line of three, middle")
        << QVector<QPoint>{{20, 20}, {120, 120}, {70, 70}} << QVector<float>{1.f, 1.f, 0.8f}
        << QPoint(70, 70) << QVector<float>{0.f, 0.f, 0.8f};
    QTest::newRow("triangle, on control 2")
        << kSlots.mid(0, 3) << QVector<float>{1.f, 1.f, 0.3f} << QPoint(105, 212)
        << QVector<float>{0.f, 0.f, 0.3f};
    QTest::newRow("eight slots, on control 5")
        << kSlots << QVector<float>(8, 0.9f) << kSlots[5]
        << QVector<float>{0.f, 0.f, 0.f, 0.f, 0.f, 0.9f, 0.f, 0.f};
    QTest::newRow("one control does nothing")
        << QVector<QPoint>{{105, 42}} << QVector<float>{1.f} << QPoint(105, 42)
        << QVector<float>{0.25f};
}

void TestRkEzMixer::drive()
{
    QFETCH(QVector<QPoint>, points);
    QFETCH(QVector<float>, values);
    QFETCH(QPoint, driver);
    QFETCH(QVector<float>, expected);

    RkSkeleton* figure = makeFigure(points.size());
    rkScene->addNode(figure);
    std::unique_ptr<RkEzMixer> mixer(makeMixer(figure, points, values));

    mixer->getDriver()->moveTo(driver.x(), driver.y());
    QCOMPARE(mixer->getDriver()->getPoint(), driver);
    const QVector<float> actual = morphValues(figure, points.size());
    QVERIFY2(fuzzyEqual(actual, expected), qPrintable(toString(actual)));
}

// Two controls on one point make the system singular: the move must leave every morph as it
// was rather than write a value that is not a number.
void TestRkEzMixer::controlsOnOnePointLeaveValues()
{
    RkSkeleton* figure = makeFigure(4);
    rkScene->addNode(figure);
    for (const QVector<QPoint>& points :
         {QVector<QPoint>{{60, 60}, {60, 60}},
          QVector<QPoint>{{105, 42}, {168, 127}, {105, 212}, {168, 127}}}) {
        std::unique_ptr<RkEzMixer> mixer(makeMixer(figure, points, {}));
        for (const QPoint& p : {QPoint(60, 60), QPoint(105, 127), QPoint(168, 127)}) {
            mixer->getDriver()->moveTo(p.x(), p.y());
            QCOMPARE(morphValues(figure, points.size()), QVector<float>(points.size(), 0.25f));
        }
    }
}

void TestRkEzMixer::dragIsOneUndoEntry()
{
    RkSkeleton* figure = makeFigure(4);
    rkScene->addNode(figure);
    std::unique_ptr<RkEzMixer> mixer(makeMixer(figure, kSlots.mid(0, 4), {1.f, 0.8f, 0.6f, 0.4f}));
    RkEzMixerDriver* driver = mixer->getDriver();
    const QVector<float> before = morphValues(figure, 4);
    const int entries = rkUndoStack->count();

    driver->startDrag();
    QVERIFY(driver->isDragging());
    for (int i = 0; i < 4; ++i)
        QVERIFY(morph(figure, i)->isEditing());
    for (const QPoint& p : {QPoint(110, 120), QPoint(130, 100), QPoint(150, 90), kSlots[1]})
        driver->moveTo(p.x(), p.y());
    driver->endDrag();
    QVERIFY(!driver->isDragging());
    for (int i = 0; i < 4; ++i)
        QVERIFY(!morph(figure, i)->isEditing());

    const QVector<float> after = morphValues(figure, 4);
    QVERIFY2(fuzzyEqual(after, {0.f, 0.8f, 0.f, 0.f}), qPrintable(toString(after)));
    QCOMPARE(rkUndoStack->count(), entries + 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Shape Mixing"));

    rkUndoStack->undo();
    QCOMPARE(morphValues(figure, 4), before);
    rkUndoStack->redo();
    QCOMPARE(morphValues(figure, 4), after);

    // A drag whose release never came is closed as its own entry when the next one starts.
    driver->startDrag();
    driver->moveTo(kSlots[2].x(), kSlots[2].y());
    driver->startDrag();
    driver->moveTo(kSlots[3].x(), kSlots[3].y());
    driver->endDrag();
    QCOMPARE(rkUndoStack->count(), entries + 3);
    rkUndoStack->undo();
    const QVector<float> second = morphValues(figure, 4);
    QVERIFY2(fuzzyEqual(second, {0.f, 0.f, 0.6f, 0.f}), qPrintable(toString(second)));
}

void TestRkEzMixer::deletedPropertyIsSkipped()
{
    RkSkeleton* figure = makeFigure(3);
    rkScene->addNode(figure);
    std::unique_ptr<RkEzMixer> mixer(makeMixer(figure, kSlots.mid(0, 3), {1.f, 1.f, 1.f}));
    RkEzMixerControl* gone = mixer->getControls()[1];
    figure->removeProperty(morph(figure, 1));
    QVERIFY(!gone->getControlProperty());

    // The control still shapes the field; only its write is skipped.
    RkEzMixerDriver* driver = mixer->getDriver();
    driver->startDrag();
    driver->moveTo(120, 100);
    driver->endDrag();
    RkEzMixerSolver solver(kSlots.mid(0, 3));
    QVector<float> w;
    QVERIFY(solver.weights(QPoint(120, 100), w));
    QVERIFY(std::fabs(morph(figure, 0)->getValue() - w[0]) < 1e-5f);
    QVERIFY(std::fabs(morph(figure, 2)->getValue() - w[2]) < 1e-5f);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Shape Mixing"));
}

void TestRkEzMixer::removalTakesOutAtOnceAndDeletesLater()
{
    RkEzMixers mixers;
    QCOMPARE(mixers.getName(), QStringLiteral("RkEzMixers"));
    auto* first = new RkEzMixer;
    auto* second = new RkEzMixer;
    mixers.addMixer(first);
    mixers.addMixer(second);
    auto* control = new RkEzMixerControl;
    auto* kept = new RkEzMixerControl;
    second->addControl(control);
    second->addControl(kept);
    QCOMPARE(control->getMixer(), second);

    QPointer<RkEzMixer> firstGuard(first);
    QPointer<RkEzMixerControl> controlGuard(control);
    mixers.removeMixer(first);
    second->removeControl(control);
    QCOMPARE(mixers.getMixers(), QVector<RkEzMixer*>{second});
    QCOMPARE(second->getControls(), QVector<RkEzMixerControl*>{kept});
    QVERIFY(firstGuard && controlGuard);

    // Something that is not there is left alone.
    mixers.removeMixer(first);
    second->removeControl(control);
    QCOMPARE(mixers.getMixers().size(), 1);
    QCOMPARE(second->getControls().size(), 1);

    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    QVERIFY(!firstGuard && !controlGuard);
}

void TestRkEzMixer::saveClearLoadRoundTrip()
{
    RkSkeleton* figure = makeFigure(12);
    rkScene->addNode(figure);
    auto* mixers = new RkEzMixers;
    figure->addDataItem(mixers);
    mixers->addMixer(makeMixer(figure, {{30, 40}, {170, 60}, {100, 200}}, {1.f, 0.5f, 0.75f}));
    QVector<QPoint> nine = kSlots;
    nine.append(QPoint(105, 127));
    QVector<float> nineValues;
    for (int i = 0; i < 9; ++i)
        nineValues.append(1.f - 0.05f * i);
    mixers->addMixer(makeMixer(figure, nine, nineValues, 3));
    mixers->getMixers()[0]->getDriver()->moveTo(120, 90);
    mixers->getMixers()[1]->getDriver()->moveTo(nine[4].x(), nine[4].y());
    // The last control's morph is gone: it is stored as a null pointer.
    figure->removeProperty(morph(figure, 11));

    struct Saved {
        QVector<QPoint> points;
        QVector<float> values;
        QVector<QImage> images;
        QVector<QString> properties;
        QPoint driver;
    };
    QVector<Saved> saved;
    for (RkEzMixer* mixer : mixers->getMixers()) {
        Saved s;
        for (RkEzMixerControl* control : mixer->getControls()) {
            s.points.append(control->getPoint());
            s.values.append(control->getValue());
            s.images.append(control->getImage());
            s.properties.append(control->getControlProperty()
                                    ? control->getControlProperty()->getName()
                                    : QString());
        }
        s.driver = mixer->getDriver()->getPoint();
        saved.append(s);
    }
    QCOMPARE(saved[1].properties.last(), QString());

    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("mixers.rks"));
    QString error;
    QVERIFY2(rkScene->save(path, &error), qPrintable(error));
    rkScene->clear();
    QCOMPARE(rkScene->getNumNodes(), 0);
    QVERIFY2(rkScene->load(path, &error), qPrintable(error));

    RkNode* loaded = rkScene->findNode(QStringLiteral("Figure"));
    QVERIFY(loaded);
    auto* loadedMixers = qobject_cast<RkEzMixers*>(loaded->findDataItem("RkEzMixers"));
    QVERIFY(loadedMixers);
    QCOMPARE(loadedMixers->getMixers().size(), 2);
    for (int m = 0; m < 2; ++m) {
        RkEzMixer* mixer = loadedMixers->getMixers()[m];
        QCOMPARE(mixer->getDriver()->getPoint(), saved[m].driver);
        QCOMPARE(mixer->getControls().size(), saved[m].points.size());
        for (int i = 0; i < mixer->getControls().size(); ++i) {
            RkEzMixerControl* control = mixer->getControls()[i];
            QCOMPARE(control->getMixer(), mixer);
            QCOMPARE(control->getPoint(), saved[m].points[i]);
            QCOMPARE(control->getValue(), saved[m].values[i]);
            QCOMPARE(control->getImage().convertToFormat(QImage::Format_ARGB32),
                     saved[m].images[i]);
            RkFloatProperty* property = control->getControlProperty();
            QCOMPARE(property ? property->getName() : QString(), saved[m].properties[i]);
            if (property)
                QCOMPARE(property->getElement(), loaded);
        }
    }

    // A loaded mixer drags like a new one: its morphs are edited, driven and undone as one.
    RkEzMixer* mixer = loadedMixers->getMixers()[1];
    RkEzMixerDriver* driver = mixer->getDriver();
    const QVector<float> before = morphValues(loaded, 8, 3);
    const int entries = rkUndoStack->count();
    driver->startDrag();
    for (int i = 0; i < 8; ++i)
        QVERIFY(morph(loaded, 3 + i)->isEditing());
    driver->moveTo(nine[0].x() + 5, nine[0].y() + 5);
    driver->moveTo(nine[2].x(), nine[2].y());
    driver->endDrag();
    QVERIFY(!morph(loaded, 3)->isEditing());
    QVector<float> expected(8, 0.f);
    expected[2] = nineValues[2];
    QVERIFY2(fuzzyEqual(morphValues(loaded, 8, 3), expected),
             qPrintable(toString(morphValues(loaded, 8, 3))));
    QCOMPARE(rkUndoStack->count(), entries + 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Shape Mixing"));
    rkUndoStack->undo();
    QCOMPARE(morphValues(loaded, 8, 3), before);
}

void TestRkEzMixer::wrongClassFailsLoad_data()
{
    QTest::addColumn<int>("row");
    QTest::newRow("a control in the mixer list") << 0;
    QTest::newRow("a driver in a control list") << 1;
    QTest::newRow("a control as the driver") << 2;
}

void TestRkEzMixer::wrongClassFailsLoad()
{
    QFETCH(int, row);

    // Whatever an impostor is stored as loads back as a real mixer list or mixer.
    rkRegisterStoredClass(QString("6a0f3c2e-0000-4000-8000-00000000000%1").arg(row),
                          &OuterImpostor::staticMetaObject, [] { return new RkEzMixers; });
    rkRegisterStoredClass(QString("6a0f3c2e-0000-4000-8000-00000000001%1").arg(row),
                          &InnerImpostor::staticMetaObject, [] { return new RkEzMixer; });
    RkSkeleton* figure = makeFigure(1);
    if (row == 0)
        figure->addDataItem(new OuterImpostor(0x210, new RkEzMixerControl));
    else if (row == 1)
        figure->addDataItem(
            new OuterImpostor(0x210, new InnerImpostor(0x220, new RkEzMixerDriver)));
    else
        figure->addDataItem(
            new OuterImpostor(0x210, new InnerImpostor(0x230, new RkEzMixerControl)));
    rkScene->addNode(figure);
    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("impostor.rks"));
    QString error;
    QVERIFY2(rkScene->save(path, &error), qPrintable(error));
    rkScene->clear();

    // The scene the user has open keeps everything when the load fails.
    RkSkeleton* kept = makeFigure(2);
    kept->setName(QStringLiteral("Kept"));
    auto* keptMixers = new RkEzMixers;
    keptMixers->addMixer(makeMixer(kept, kSlots.mid(0, 2), {1.f, 1.f}));
    kept->addDataItem(keptMixers);
    rkScene->addNode(kept);

    QVERIFY(!rkScene->load(path, &error));
    QVERIFY2(error.contains(QStringLiteral("Failure to cast RkAssertCast")), qPrintable(error));
    QCOMPARE(rkScene->getNodes(), RkNodeList{kept});
    QCOMPARE(kept->findDataItem(QStringLiteral("RkEzMixers")), keptMixers);
    QCOMPARE(keptMixers->getMixers().size(), 1);
    QCOMPARE(keptMixers->getMixers()[0]->getControls().size(), 2);
}

RK_TEST_MAIN(TestRkEzMixer)
#include "tst_rkezmixer.moc"
