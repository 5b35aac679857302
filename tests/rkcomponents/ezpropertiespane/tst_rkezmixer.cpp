#include "rkezmixer.h"
#include "rkezmixercontrol.h"
#include "rkezmixerdriver.h"
#include "rkezmixers.h"

#include "app/rkapp.h"
#include "io/rkoutfile.h"
#include "plugin/rkclassfactory.h"
#include "plugin/rkguid.h"
#include "plugin/rkpluginmgr.h"
#include "properties/rkfloatproperty.h"
#include "rkcomponentsplugin.h"
#include "rktestmain.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostack.h"

#include <QPainter>
#include <QPointer>
#include <QTemporaryDir>

#include <cmath>
#include <limits>
#include <memory>

namespace
{

const QVector<QPoint> kSlots = {{105, 42}, {168, 127}, {105, 212}, {42, 127},
                                {149, 66}, {149, 187}, {60, 187},  {60, 66}};

// A figure with morphs "Morph 0" .. "Morph n-1", all at 0.25 and clamped to [0, 1].
RkSkeleton* makeFigure(int morphs, const QString& name = QStringLiteral("Figure"))
{
    auto* figure = new RkSkeleton;
    figure->setName(name);
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

QVector<float> morphValues(RkNode* figure, int count, int first = 0)
{
    QVector<float> values;
    for (int i = first; i < first + count; ++i)
        values.append(morph(figure, i)->getValue());
    return values;
}

// Controls on the figure's morphs from `first` on, each with a thumbnail of its own that has
// transparent corners.
RkEzMixer* makeMixer(RkNode* figure, const QVector<QPoint>& points, const QVector<float>& values,
                     int first = 0)
{
    auto* mixer = new RkEzMixer;
    for (int i = 0; i < points.size(); ++i) {
        auto* control = new RkEzMixerControl;
        control->setControlProperty(morph(figure, first + i));
        control->setValue(values.value(i, 1.f));
        QImage image(85, 85, QImage::Format_ARGB32);
        image.fill(Qt::transparent);
        QPainter(&image).fillRect(10 + i, 20, 40, 30 + i, QColor(30 * i % 256, 90, 200, 180));
        control->setImage(image);
        control->setX(points[i].x());
        control->setY(points[i].y());
        mixer->addControl(control);
    }
    return mixer;
}

// Empty when the values agree to 1e-4, else both lists for the failure message.
QString mismatch(const QVector<float>& actual, const QVector<float>& expected)
{
    bool same = actual.size() == expected.size();
    for (int i = 0; same && i < actual.size(); ++i)
        same = std::fabs(actual[i] - expected[i]) <= 1e-4f;
    if (same)
        return QString();
    QString text;
    QDebug(&text) << actual << "instead of" << expected;
    return text;
}

#define COMPARE_VALUES(actual, expected)                                                           \
    do {                                                                                           \
        const QString text_ = mismatch((actual), (expected));                                      \
        QVERIFY2(text_.isEmpty(), qPrintable(text_));                                              \
    } while (false)

// Stores a pointer list under a mixer section id, but to an object of the wrong class. It is
// stored under a GUID that loads back as a real mixer list, which then meets that object.
class Impostor : public RkElementData
{
    Q_OBJECT
public:
    explicit Impostor(RkBase* target)
        : RkElementData(QStringLiteral("RkEzMixers")), m_target(target)
    {
        target->setParent(this);
    }
    void save(RkOutFile* file) const override
    {
        file->startSection(0x210);
        file->writePointer(m_target, 0);
        file->endSection();
    }

private:
    RkBase* m_target;
};

// Saves an Impostor under its own GUID and makes a real mixer list from it on load.
class ImpostorFactory : public RkClassFactory
{
public:
    ImpostorFactory()
        : RkClassFactory(&Impostor::staticMetaObject,
                         RkGUID::fromString(QStringLiteral("6a0f3c2e-0000-4000-8000-000000000001")))
    {
    }
    QObject* createInstance() override { return new RkEzMixers; }
};

} // namespace

class TestRkEzMixer : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void cleanup();
    void drive_data();
    void drive();
    void dragIsOneUndoEntry();
    void removalTakesOutAtOnceAndDeletesLater();
    void saveClearLoadRoundTrip();
    void wrongClassIsRefused();
};

// The host makes stored mixers through the module's class factories.
void TestRkEzMixer::initTestCase()
{
    QVERIFY(rkApp->getPluginMgr()->addPlugin(rkComponentsPlugin()));
}

void TestRkEzMixer::cleanup()
{
    rkScene->clear();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

void TestRkEzMixer::drive_data()
{
    QTest::addColumn<QVector<QPoint>>("points");
    QTest::addColumn<QVector<float>>("values");
    QTest::addColumn<QPoint>("driver");
    QTest::addColumn<QVector<float>>("expected");

    const QVector<QPoint> pair = {{40, 100}, {140, 100}};
    QTest::newRow("pair, halfway")
        << pair << QVector<float>{1.f, 0.5f} << QPoint(90, 100) << QVector<float>{0.5f, 0.25f};
    // Weights are not clamped, and the plain setter stores values outside the morph's limits.
    QTest::newRow("pair, beyond control 1")
        << pair << QVector<float>{1.f, 0.5f} << QPoint(190, 40) << QVector<float>{-0.5f, 0.75f};
    QTest::newRow("line of three")
        << QVector<QPoint>{{20, 20}, {120, 120}, {70, 70}} << QVector<float>{1.f, 1.f, 0.8f}
        << QPoint(70, 70) << QVector<float>{0.f, 0.f, 0.8f};
    QTest::newRow("eight slots, on control 5")
        << kSlots << QVector<float>(8, 0.9f) << kSlots[5]
        << QVector<float>{0.f, 0.f, 0.f, 0.f, 0.f, 0.9f, 0.f, 0.f};
    QTest::newRow("one control does nothing") << QVector<QPoint>{{105, 42}} << QVector<float>{1.f}
                                              << QPoint(105, 42) << QVector<float>{0.25f};

    // A move sets every morph or none. Two controls on one point leave no weights, and a value
    // times its weight that is not finite stops the move before the first write.
    const QVector<QPoint> twoOnOne = {{105, 42}, {168, 127}, {105, 212}, {168, 127}};
    QTest::newRow("two on one point, driver between")
        << twoOnOne << QVector<float>{} << QPoint(105, 127) << QVector<float>(4, 0.25f);
    QTest::newRow("two on one point, driver on them")
        << twoOnOne << QVector<float>{} << QPoint(168, 127) << QVector<float>(4, 0.25f);
    const float huge = std::numeric_limits<float>::max();
    const float nan = std::numeric_limits<float>::quiet_NaN();
    QTest::newRow("value times weight overflows")
        << pair << QVector<float>{huge, 1.f} << QPoint(-10, 100) << QVector<float>(2, 0.25f);
    QTest::newRow("value not a number")
        << pair << QVector<float>{nan, 1.f} << QPoint(90, 100) << QVector<float>(2, 0.25f);
    // A control whose morph is gone writes nothing, so its value stops nothing.
    QTest::newRow("value not a number, morph gone")
        << QVector<QPoint>{{40, 100}, {140, 100}, {90, 100}} << QVector<float>{1.f, 0.5f, nan}
        << QPoint(40, 100) << QVector<float>{1.f, 0.f};
}

void TestRkEzMixer::drive()
{
    QFETCH(QVector<QPoint>, points);
    QFETCH(QVector<float>, values);
    QFETCH(QPoint, driver);
    QFETCH(QVector<float>, expected);

    // Controls past the figure's last morph have none.
    RkSkeleton* figure = makeFigure(expected.size());
    rkScene->addNode(figure);
    std::unique_ptr<RkEzMixer> mixer(makeMixer(figure, points, values));
    mixer->getDriver()->moveTo(driver.x(), driver.y());
    COMPARE_VALUES(morphValues(figure, expected.size()), expected);
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
    QVERIFY(morph(figure, 3)->isEditing());
    for (const QPoint& p : {QPoint(110, 120), QPoint(150, 90), kSlots[1]})
        driver->moveTo(p.x(), p.y());
    driver->endDrag();
    QVERIFY(!morph(figure, 3)->isEditing());
    COMPARE_VALUES(morphValues(figure, 4), (QVector<float>{0.f, 0.8f, 0.f, 0.f}));
    QCOMPARE(rkUndoStack->count(), entries + 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Shape Mixing"));
    const QVector<float> after = morphValues(figure, 4);
    rkUndoStack->undo();
    QCOMPARE(morphValues(figure, 4), before);
    rkUndoStack->redo();
    QCOMPARE(morphValues(figure, 4), after);

    // A drag whose release never came is kept as its own entry when the next one starts.
    driver->startDrag();
    driver->moveTo(kSlots[2].x(), kSlots[2].y());
    driver->startDrag();
    driver->moveTo(kSlots[3].x(), kSlots[3].y());
    driver->endDrag();
    QCOMPARE(rkUndoStack->count(), entries + 3);
    rkUndoStack->undo();
    COMPARE_VALUES(morphValues(figure, 4), (QVector<float>{0.f, 0.f, 0.6f, 0.f}));
}

void TestRkEzMixer::removalTakesOutAtOnceAndDeletesLater()
{
    RkEzMixers mixers;
    QPointer<RkEzMixer> first = new RkEzMixer;
    auto* second = new RkEzMixer;
    mixers.addMixer(first);
    mixers.addMixer(second);
    QPointer<RkEzMixerControl> control = new RkEzMixerControl;
    second->addControl(control);
    QCOMPARE(control->getMixer(), second);

    mixers.removeMixer(first);
    second->removeControl(control);
    QCOMPARE(mixers.getMixers(), QVector<RkEzMixer*>{second});
    QVERIFY(second->getControls().isEmpty());
    QVERIFY(first && control);
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    QVERIFY(!first && !control);
}

void TestRkEzMixer::saveClearLoadRoundTrip()
{
    RkSkeleton* figure = makeFigure(12);
    rkScene->addNode(figure);
    auto* mixers = new RkEzMixers;
    figure->addDataItem(mixers);
    mixers->addMixer(makeMixer(figure, {{30, 40}, {170, 60}, {100, 200}}, {1.f, 0.5f, 0.75f}));
    const QVector<QPoint> nine = kSlots + QVector<QPoint>{{105, 127}};
    const QVector<float> nineValues = {1.f, 0.9f, 0.8f, 0.7f, 0.6f, 0.5f, 0.4f, 0.3f, 0.2f};
    mixers->addMixer(makeMixer(figure, nine, nineValues, 3));
    mixers->getMixers()[0]->getDriver()->moveTo(120, 90);
    // The last control's morph is gone: it is stored as a null pointer.
    figure->removeProperty(morph(figure, 11));

    QVector<QVector<RkEzMixerControl*>> saved;
    QStringList morphs; // the morph of each control, by name, as the clear deletes them
    for (RkEzMixer* mixer : mixers->getMixers()) {
        saved.append(mixer->getControls());
        for (RkEzMixerControl* control : mixer->getControls())
            morphs << (control->getControlProperty() ? control->getControlProperty()->getName()
                                                     : QString());
    }
    QCOMPARE(morphs.last(), QString());
    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("mixers.rks"));
    QString error;
    QVERIFY2(rkScene->save(path, &error), qPrintable(error));
    // Keep the originals to compare with while the scene is cleared.
    figure->takeDataItem(mixers);
    std::unique_ptr<RkEzMixers> original(mixers);
    rkScene->clear();
    QVERIFY2(rkScene->load(path, &error), qPrintable(error));

    RkNode* loaded = rkScene->findNode(QStringLiteral("Figure"));
    QVERIFY(loaded);
    auto* loadedMixers = qobject_cast<RkEzMixers*>(loaded->findDataItem("RkEzMixers"));
    QVERIFY(loadedMixers);
    QCOMPARE(loadedMixers->getMixers().size(), 2);
    for (int m = 0; m < 2; ++m) {
        RkEzMixer* mixer = loadedMixers->getMixers()[m];
        QCOMPARE(mixer->getDriver()->getPoint(), original->getMixers()[m]->getDriver()->getPoint());
        QCOMPARE(mixer->getControls().size(), saved[m].size());
        for (int i = 0; i < saved[m].size(); ++i) {
            RkEzMixerControl* control = mixer->getControls()[i];
            RkEzMixerControl* was = saved[m][i];
            QCOMPARE(control->getMixer(), mixer);
            QCOMPARE(control->getPoint(), was->getPoint());
            QCOMPARE(control->getValue(), was->getValue());
            QCOMPARE(control->getImage().convertToFormat(QImage::Format_ARGB32), was->getImage());
            const QString name = morphs.takeFirst();
            QCOMPARE(control->getControlProperty(),
                     name.isEmpty() ? nullptr : loaded->findProperty(name));
        }
    }
    QCOMPARE(mixers->getMixers()[0]->getDriver()->getPoint(), QPoint(120, 90));

    // A loaded mixer drags like a new one: its morphs are edited, driven and undone as one,
    // and the control whose morph is gone is skipped.
    RkEzMixerDriver* driver = loadedMixers->getMixers()[1]->getDriver();
    const QVector<float> before = morphValues(loaded, 8, 3);
    const int entries = rkUndoStack->count();
    driver->startDrag();
    QVERIFY(morph(loaded, 3)->isEditing());
    driver->moveTo(nine[0].x() + 5, nine[0].y() + 5);
    driver->moveTo(nine[2].x(), nine[2].y());
    driver->endDrag();
    QVERIFY(!morph(loaded, 3)->isEditing());
    COMPARE_VALUES(morphValues(loaded, 8, 3),
                   (QVector<float>{0.f, 0.f, 0.8f, 0.f, 0.f, 0.f, 0.f, 0.f}));
    QCOMPARE(rkUndoStack->count(), entries + 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Shape Mixing"));
    rkUndoStack->undo();
    QCOMPARE(morphValues(loaded, 8, 3), before);
}

void TestRkEzMixer::wrongClassIsRefused()
{
    // Every stored pointer is checked as it is resolved; a null one passes.
    RkEzMixers mixers;
    RkEzMixer mixer;
    RkEzMixerControl control;
    RkEzMixerDriver driver;
    const QString message = QStringLiteral("Failure to cast RkAssertCast");
    QVERIFY_EXCEPTION_THROWN(mixers.setPointer(nullptr, 0x210, 0, &control), QString);
    QVERIFY_EXCEPTION_THROWN(mixer.setPointer(nullptr, 0x220, 0, &driver), QString);
    QVERIFY_EXCEPTION_THROWN(mixer.setPointer(nullptr, 0x230, 0, &control), QString);
    try {
        control.setPointer(nullptr, 0x221, 0, &mixer);
        QFAIL("a mixer taken for a morph");
    } catch (const QString& e) {
        QCOMPARE(e, message);
    }
    mixer.setPointer(nullptr, 0x230, 0, nullptr);
    control.setPointer(nullptr, 0x221, 0, nullptr);
    QVERIFY(mixer.getDriver() && mixer.getControls().isEmpty() && mixers.getMixers().isEmpty());

    // In a file, the load fails with that message and the open scene stays as it was.
    static ImpostorFactory impostorFactory;
    QVERIFY(rkApp->getPluginMgr()->addClassFactory(&impostorFactory));
    RkSkeleton* figure = makeFigure(1);
    figure->addDataItem(new Impostor(new RkEzMixerControl));
    rkScene->addNode(figure);
    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("impostor.rks"));
    QString error;
    QVERIFY2(rkScene->save(path, &error), qPrintable(error));
    rkScene->clear();
    RkSkeleton* kept = makeFigure(2, QStringLiteral("Kept"));
    auto* keptMixers = new RkEzMixers;
    keptMixers->addMixer(makeMixer(kept, kSlots.mid(0, 2), {}));
    kept->addDataItem(keptMixers);
    rkScene->addNode(kept);

    QVERIFY(!rkScene->load(path, &error));
    QVERIFY2(error.contains(message), qPrintable(error));
    QCOMPARE(rkScene->getNodes(), RkNodeList{kept});
    QCOMPARE(kept->findDataItem(QStringLiteral("RkEzMixers")), keptMixers);
    QCOMPARE(keptMixers->getMixers()[0]->getControls().size(), 2);
}

RK_TEST_MAIN(TestRkEzMixer)
#include "tst_rkezmixer.moc"
