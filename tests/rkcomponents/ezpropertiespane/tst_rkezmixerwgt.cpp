// Mouse events go through the window: a drag keeps reaching the widget it started on.
#define QTEST_QPA_MOUSE_HANDLING

#include "rkezmixer.h"
#include "rkezmixercontrol.h"
#include "rkezmixercontrolwgt.h"
#include "rkezmixerdriver.h"
#include "rkezmixerdriverwgt.h"
#include "rkezmixers.h"
#include "rkezmixersetup.h"
#include "rkezmixerwgt.h"

#include "plugin/rkpluginmgr.h"
#include "properties/rkfloatproperty.h"
#include "rkcomponentsplugin.h"
#include "rktestmain.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostack.h"

#include <QMenu>
#include <QPainter>
#include <QPointer>
#include <QTemporaryDir>

#include <cmath>

namespace
{

const QVector<QPoint> kSlots = {{105, 42}, {168, 127}, {105, 212}, {42, 127},
                                {149, 66}, {149, 187}, {60, 187},  {60, 66}};

RkFloatProperty* morph(RkNode* figure, int i)
{
    return qobject_cast<RkFloatProperty*>(figure->findProperty(QString("Morph %1").arg(i)));
}

QVector<float> morphValues(RkNode* figure, int count)
{
    QVector<float> values;
    for (int i = 0; i < count; ++i)
        values.append(morph(figure, i)->getValue());
    return values;
}

// A figure in the scene with morphs "Morph 0" .. "Morph n-1", all at 0.25.
RkSkeleton* addFigure(int morphs)
{
    auto* figure = new RkSkeleton;
    figure->setName(QStringLiteral("Figure"));
    for (int i = 0; i < morphs; ++i) {
        auto* property =
            new RkFloatProperty(QString("Morph %1").arg(i), QString("Morph %1").arg(i));
        property->setValue(0.25f);
        figure->addProperty(property, QStringLiteral("Morphs"));
    }
    rkScene->addNode(figure);
    return figure;
}

// 85 by 85, opaque inside a clear border 10 pixels wide.
QImage thumbnail(int i)
{
    QImage image(85, 85, QImage::Format_ARGB32);
    image.fill(Qt::transparent);
    QPainter(&image).fillRect(10, 10, 65, 65, QColor(40 * i % 256, 120, 200));
    return image;
}

// Controls on morphs 0, 1 ... at the points; a null image where `images` says so.
RkEzMixer* makeMixer(RkNode* figure, const QVector<QPoint>& points, QVector<QImage> images = {})
{
    auto* mixer = new RkEzMixer;
    for (int i = 0; i < points.size(); ++i) {
        auto* control = new RkEzMixerControl;
        control->setControlProperty(morph(figure, i));
        control->setImage(i < images.size() ? images[i] : thumbnail(i));
        control->setX(points[i].x());
        control->setY(points[i].y());
        mixer->addControl(control);
    }
    return mixer;
}

bool near(const QVector<float>& actual, const QVector<float>& expected)
{
    for (int i = 0; i < actual.size(); ++i) {
        if (std::fabs(actual[i] - expected.value(i)) > 1e-4f)
            return false;
    }
    return actual.size() == expected.size();
}

QPoint centre(const QWidget* w)
{
    return w->pos() + QPoint(w->width() / 2, w->height() / 2);
}

// Left-drags on the page from one point through the others, in page coordinates.
void drag(QWidget* page, const QVector<QPoint>& path, bool release = true)
{
    QTest::mousePress(page, Qt::LeftButton, {}, path.first());
    for (const QPoint& p : path.mid(1))
        QTest::mouseMove(page, p);
    if (release)
        QTest::mouseRelease(page, Qt::LeftButton, {}, path.last());
}

// Right-clicks at the point and picks the entry from the menu that opens.
void pickFromContextMenu(QWidget* page, const QPoint& at, const QString& entry)
{
    QTimer timer;
    bool picked = false;
    QObject::connect(&timer, &QTimer::timeout, [&] {
        auto* menu = qobject_cast<QMenu*>(QApplication::activePopupWidget());
        for (QAction* action : menu ? menu->actions() : QList<QAction*>()) {
            if (action->text() == entry && !picked) {
                picked = true;
                QTest::mouseClick(menu, Qt::LeftButton, {}, menu->actionGeometry(action).center());
            }
        }
    });
    timer.start(10);
    QTest::mouseClick(page, Qt::RightButton, {}, at);
    QTRY_VERIFY(picked);
}

} // namespace

class TestRkEzMixerWgt : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void init();
    void cleanup();
    void handleDragIsOneUndoEntry();
    void thumbnailDragMovesOnlyItsControl();
    void contextMenuDeletesControl();
    void controlsWithoutThumbnailOrMorph();
    void handleDestroyedMidDragClosesItsHold();
    void loadedMixerShowsItsControls();
    void droppedTilesFillTheSlots();

private:
    RkEzMixerWgt* showPage(RkEzMixer* mixer);
    std::unique_ptr<QWidget> m_window;
};

void TestRkEzMixerWgt::initTestCase()
{
    QVERIFY(rkApp->getPluginMgr()->addPlugin(rkComponentsPlugin()));
}

void TestRkEzMixerWgt::init()
{
    m_window = std::make_unique<QWidget>();
    m_window->resize(300, 320);
}

void TestRkEzMixerWgt::cleanup()
{
    m_window.reset();
    rkScene->clear();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

RkEzMixerWgt* TestRkEzMixerWgt::showPage(RkEzMixer* mixer)
{
    auto* page = new RkEzMixerWgt(m_window.get(), mixer);
    page->setGeometry(0, 0, 220, 260);
    m_window->show();
    if (!QTest::qWaitForWindowExposed(m_window.get()))
        return nullptr;
    return page;
}

void TestRkEzMixerWgt::handleDragIsOneUndoEntry()
{
    RkSkeleton* figure = addFigure(4);
    std::unique_ptr<RkEzMixer> mixer(makeMixer(figure, kSlots.mid(0, 4)));
    RkEzMixerWgt* page = showPage(mixer.get());
    QVERIFY(page);
    RkEzMixerDriverWgt* handle = page->getDriverWgt();
    QCOMPARE(handle->size(), QSize(30, 30));
    QCOMPARE(centre(handle), QPoint(105, 127));
    QSignalSpy moved(mixer->getDriver(), &RkEzMixerDriver::moved);
    const QVector<float> before = morphValues(figure, 4);
    const int entries = rkUndoStack->count();

    // Past the page's corner the handle stops at the edge; a move that leaves it where it is
    // does not drive.
    drag(page, {{105, 127}, {130, 110}, {290, 2}, {295, 1}, {168, 127}}, false);
    QCOMPARE(moved.count(), 3);
    QCOMPARE(moved.at(1).at(0).toPoint(), QPoint(220 - 15, 15));
    QCOMPARE(mixer->getDriver()->getPoint(), QPoint(168, 127));
    QCOMPARE(centre(handle), QPoint(168, 127));
    QVERIFY(rkUndoStack->canPushItems());
    QTest::mouseRelease(page, Qt::LeftButton, {}, {168, 127});
    QVERIFY(!rkUndoStack->canPushItems());
    QVERIFY(near(morphValues(figure, 4), {0.f, 1.f, 0.f, 0.f}));
    QCOMPARE(rkUndoStack->count(), entries + 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Shape Mixing"));
    rkUndoStack->undo();
    QCOMPARE(morphValues(figure, 4), before);
}

void TestRkEzMixerWgt::thumbnailDragMovesOnlyItsControl()
{
    RkSkeleton* figure = addFigure(4);
    std::unique_ptr<RkEzMixer> mixer(makeMixer(figure, kSlots.mid(0, 4)));
    RkEzMixerWgt* page = showPage(mixer.get());
    QVERIFY(page);
    const QVector<RkEzMixerControlWgt*> wgts = page->getControlWgts();
    QCOMPARE(wgts.size(), 4);
    RkEzMixerControlWgt* wgt = wgts[1];
    QCOMPARE(wgt->geometry(), QRect(168 - 42, 127 - 42, 85, 85));
    // Only the opaque part of a thumbnail takes the mouse.
    QCOMPARE(page->childAt(kSlots[1] + QPoint(-30, 0)), wgt);
    QVERIFY(page->childAt(kSlots[1] + QPoint(-38, 0)) != wgt);
    const QVector<float> before = morphValues(figure, 4);
    const int entries = rkUndoStack->count();

    drag(page, {kSlots[1], kSlots[1] + QPoint(-10, 15), kSlots[1] + QPoint(-20, 30)});
    QCOMPARE(wgt->getControl()->getPoint(), kSlots[1] + QPoint(-20, 30));
    QCOMPARE(centre(wgt), kSlots[1] + QPoint(-20, 30));
    for (int i : {0, 2, 3})
        QCOMPARE(mixer->getControls()[i]->getPoint(), kSlots[i]);
    QCOMPARE(mixer->getDriver()->getPoint(), QPoint(105, 127));
    QCOMPARE(morphValues(figure, 4), before);
    QCOMPARE(rkUndoStack->count(), entries);
}

void TestRkEzMixerWgt::contextMenuDeletesControl()
{
    RkSkeleton* figure = addFigure(3);
    std::unique_ptr<RkEzMixer> mixer(makeMixer(figure, kSlots.mid(0, 3)));
    RkEzMixerWgt* page = showPage(mixer.get());
    QVERIFY(page);
    QPointer<RkEzMixerControlWgt> wgt = page->getControlWgts()[0];
    QPointer<RkEzMixerControl> control = mixer->getControls()[0];
    const int entries = rkUndoStack->count();

    pickFromContextMenu(page, kSlots[0], QStringLiteral("Delete"));
    QVERIFY(!mixer->getControls().contains(control));
    QCOMPARE(page->getControlWgts().size(), 2);
    QCOMPARE(rkUndoStack->count(), entries);
    QTRY_VERIFY(!wgt && !control);
}

// A thumbnail that is missing or clear throughout, or a morph that is gone, still leaves a box
// the user can see, move and delete.
void TestRkEzMixerWgt::controlsWithoutThumbnailOrMorph()
{
    RkSkeleton* figure = addFigure(3);
    QImage clear(85, 85, QImage::Format_ARGB32);
    clear.fill(Qt::transparent);
    std::unique_ptr<RkEzMixer> mixer(
        makeMixer(figure, kSlots.mid(0, 3), {QImage(), clear, QImage()}));
    figure->removeProperty(morph(figure, 2));
    RkEzMixerWgt* page = showPage(mixer.get());
    QVERIFY(page);
    const QVector<RkEzMixerControlWgt*> wgts = page->getControlWgts();
    for (int i = 0; i < 3; ++i) {
        QVERIFY(wgts[i]->isPlaceholder());
        QCOMPARE(wgts[i]->geometry(), QRect(kSlots[i] - QPoint(42, 42), QSize(85, 85)));
        QCOMPARE(page->childAt(kSlots[i] + QPoint(-40, -40)), wgts[i]);
    }
    QCOMPARE(wgts[0]->placeholderText(), QStringLiteral("Morph 0"));
    QCOMPARE(wgts[2]->placeholderText(), QStringLiteral("Unnamed"));
    QVERIFY(!wgts[2]->grab().isNull());

    drag(page, {kSlots[0], kSlots[0] + QPoint(5, 5)});
    QCOMPARE(mixer->getControls()[0]->getPoint(), kSlots[0] + QPoint(5, 5));
    pickFromContextMenu(page, kSlots[2], QStringLiteral("Delete"));
    QCOMPARE(mixer->getControls().size(), 2);
}

void TestRkEzMixerWgt::handleDestroyedMidDragClosesItsHold()
{
    RkSkeleton* figure = addFigure(2);
    std::unique_ptr<RkEzMixer> mixer(makeMixer(figure, {{40, 127}, {170, 127}}));
    RkEzMixerWgt* page = showPage(mixer.get());
    QVERIFY(page);
    const int entries = rkUndoStack->count();
    drag(page, {{105, 127}, {140, 127}}, false);
    QVERIFY(rkUndoStack->canPushItems());

    delete page;
    QVERIFY(!rkUndoStack->canPushItems());
    QCOMPARE(rkUndoStack->count(), entries + 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Shape Mixing"));
    QTest::mouseRelease(m_window.get(), Qt::LeftButton, {}, {140, 127});
}

void TestRkEzMixerWgt::loadedMixerShowsItsControls()
{
    RkSkeleton* figure = addFigure(4);
    const QVector<QPoint> points = {{30, 40}, {170, 60}, {100, 200}, {150, 150}};
    auto* mixers = new RkEzMixers;
    figure->addDataItem(mixers);
    // An opaque thumbnail loads without an alpha channel: all of it takes the mouse.
    QImage opaque(85, 85, QImage::Format_RGB32);
    opaque.fill(Qt::darkCyan);
    mixers->addMixer(makeMixer(figure, points, {thumbnail(0), thumbnail(1), opaque, {}}));
    mixers->getMixers()[0]->getDriver()->moveTo(120, 90);
    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("mixer.rks"));
    QString error;
    QVERIFY2(rkScene->save(path, &error), qPrintable(error));
    rkScene->clear();
    QVERIFY2(rkScene->load(path, &error), qPrintable(error));

    RkEzMixers* loaded = RkEzMixerSetup::findMixers(rkScene->findNode(QStringLiteral("Figure")));
    QVERIFY(loaded && loaded->getMixers().size() == 1);
    RkEzMixerWgt* page = showPage(loaded->getMixers()[0]);
    QVERIFY(page);
    QCOMPARE(centre(page->getDriverWgt()), QPoint(120, 90));
    const QVector<RkEzMixerControlWgt*> wgts = page->getControlWgts();
    QCOMPARE(wgts.size(), 4);
    for (int i = 0; i < 4; ++i) {
        QCOMPARE(centre(wgts[i]), points[i]);
        QCOMPARE(page->childAt(points[i]), wgts[i]);
        QCOMPARE(wgts[i]->isPlaceholder(), i == 3);
    }
    QCOMPARE(page->childAt(points[2] + QPoint(-41, 41)), wgts[2]);
}

void TestRkEzMixerWgt::droppedTilesFillTheSlots()
{
    RkSkeleton* figure = addFigure(10);
    QVERIFY(!RkEzMixerSetup::findMixers(figure));
    RkEzMixer* first = RkEzMixerSetup::addMixer(figure);
    RkEzMixer* second = RkEzMixerSetup::addMixer(figure);
    QCOMPARE(RkEzMixerSetup::findMixers(figure)->getMixers(), (QVector<RkEzMixer*>{first, second}));
    QCOMPARE(RkEzMixerSetup::tabText(2), QStringLiteral("Mixer 2"));

    // A wide tile: only its centred square, blue, becomes the control's image.
    QImage tile(120, 90, QImage::Format_ARGB32);
    tile.fill(Qt::red);
    QPainter(&tile).fillRect(15, 0, 90, 90, Qt::blue);
    RkEzMixerWgt* page = showPage(second);
    QVERIFY(page);
    for (int i = 0; i < 10; ++i) {
        RkEzMixerControl* control =
            RkEzMixerSetup::addControl(second, morph(figure, i), i < 9 ? tile : QImage());
        RkEzMixerControlWgt* wgt = page->addControlWgt(control);
        QCOMPARE(control->getPoint(), kSlots[i % 8]);
        QCOMPARE(control->getControlProperty(), morph(figure, i));
        QCOMPARE(control->getValue(), 1.f);
        QVERIFY(wgt->isVisible());
        QCOMPARE(centre(wgt), kSlots[i % 8]);
    }
    const QImage image = second->getControls()[0]->getImage();
    QCOMPARE(image.size(), QSize(85, 85));
    QCOMPARE(image.pixelColor(0, 42), QColor(Qt::blue));
    QVERIFY(second->getControls()[9]->getImage().isNull());
    QVERIFY(first->getControls().isEmpty());
}

RK_TEST_MAIN(TestRkEzMixerWgt)
#include "tst_rkezmixerwgt.moc"
