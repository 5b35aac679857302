// Mouse events go through the window: a drag keeps reaching the widget it started on.
#define QTEST_QPA_MOUSE_HANDLING

#include "plugin/rkpluginmgr.h"
#include "properties/rkfloatproperty.h"
#include "rkcomponentsplugin.h"
#include "rkezmixer.h"
#include "rkezmixercontrol.h"
#include "rkezmixercontrolwgt.h"
#include "rkezmixerdriver.h"
#include "rkezmixerdriverwgt.h"
#include "rkezmixers.h"
#include "rkezmixersetup.h"
#include "rkezmixerwgt.h"
#include "rktestmain.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostack.h"

#include <QMenu>
#include <QPainter>
#include <QTemporaryDir>

namespace
{

const QVector<QPoint> kSlots = {{105, 42}, {168, 127}, {105, 212}, {42, 127},
                                {149, 66}, {149, 187}, {60, 187},  {60, 66}};

QPoint centre(const QWidget* w)
{
    return w->pos() + QPoint(w->width() / 2, w->height() / 2);
}

// Left-drags along the path, in page coordinates.
void drag(QWidget* page, const QVector<QPoint>& path, bool release = true)
{
    QTest::mousePress(page, Qt::LeftButton, {}, path.first());
    for (const QPoint& p : path.mid(1))
        QTest::mouseMove(page, p);
    if (release)
        QTest::mouseRelease(page, Qt::LeftButton, {}, path.last());
}

// Right-clicks at the point and picks "Delete" from the menu that opens.
void deleteThroughMenu(QWidget* page, const QPoint& at)
{
    QTimer timer;
    bool picked = false;
    QObject::connect(&timer, &QTimer::timeout, [&] {
        auto* menu = qobject_cast<QMenu*>(QApplication::activePopupWidget());
        if (!menu || picked || menu->actions().value(0)->text() != "Delete")
            return;
        picked = true;
        QTest::mouseClick(menu, Qt::LeftButton, {},
                          menu->actionGeometry(menu->actions()[0]).center());
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
    void initTestCase() { QVERIFY(rkApp->getPluginMgr()->addPlugin(rkComponentsPlugin())); }
    void cleanup();
    void handleDrivesAsOneUndoEntry();
    void thumbnailsMoveAndDelete();
    void controlsWithoutThumbnailOrMorph();
    void loadedMixerShowsItsControls();
    void droppedTilesFillTheSlots();

private:
    RkFloatProperty* morph(int i) const;
    // A figure with morphs "Morph 0" .. at 0.25, kept as the mixer list of its node, and one
    // mixer with a control per point on morphs 0, 1 ...; a thumbnail opaque inside a clear
    // border 10 pixels wide unless `images` gives another.
    void makeMixer(int morphs, const QVector<QPoint>& points, const QVector<QImage>& images = {});
    RkEzMixerWgt* showPage(RkEzMixer* mixer);

    RkSkeleton* m_figure = nullptr;
    RkEzMixer* m_mixer = nullptr;
    std::unique_ptr<QWidget> m_window;
};

void TestRkEzMixerWgt::cleanup()
{
    m_window.reset();
    rkScene->clear();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

RkFloatProperty* TestRkEzMixerWgt::morph(int i) const
{
    return qobject_cast<RkFloatProperty*>(m_figure->findProperty(QString("Morph %1").arg(i)));
}

void TestRkEzMixerWgt::makeMixer(int morphs, const QVector<QPoint>& points,
                                 const QVector<QImage>& images)
{
    m_figure = new RkSkeleton;
    m_figure->setName(QStringLiteral("Figure"));
    for (int i = 0; i < morphs; ++i) {
        const QString name = QString("Morph %1").arg(i);
        auto* property = new RkFloatProperty(name, name);
        property->setValue(0.25f);
        m_figure->addProperty(property, QStringLiteral("Morphs"));
    }
    rkScene->addNode(m_figure);
    QImage thumbnail(85, 85, QImage::Format_ARGB32);
    thumbnail.fill(Qt::transparent);
    QPainter(&thumbnail).fillRect(10, 10, 65, 65, Qt::darkBlue);
    m_mixer = RkEzMixerSetup::addMixer(m_figure);
    for (int i = 0; i < points.size(); ++i) {
        auto* control = new RkEzMixerControl;
        control->setControlProperty(morph(i));
        control->setImage(images.value(i, thumbnail));
        control->setX(points[i].x());
        control->setY(points[i].y());
        m_mixer->addControl(control);
    }
}

RkEzMixerWgt* TestRkEzMixerWgt::showPage(RkEzMixer* mixer)
{
    m_window = std::make_unique<QWidget>();
    m_window->resize(300, 320);
    auto* page = new RkEzMixerWgt(m_window.get(), mixer);
    page->setGeometry(0, 0, 220, 260);
    m_window->show();
    return QTest::qWaitForWindowExposed(m_window.get()) ? page : nullptr;
}

void TestRkEzMixerWgt::handleDrivesAsOneUndoEntry()
{
    makeMixer(4, kSlots.mid(0, 4));
    RkEzMixerWgt* page = showPage(m_mixer);
    QVERIFY(page);
    RkEzMixerDriverWgt* handle = page->getDriverWgt();
    QCOMPARE(handle->geometry(), QRect(90, 112, 30, 30));
    QSignalSpy moved(m_mixer->getDriver(), &RkEzMixerDriver::moved);
    const int entries = rkUndoStack->count();

    // Past the page's corner the handle stops at the edge; a move that leaves it where it is
    // does not drive.
    drag(page, {{105, 127}, {130, 110}, {290, 2}, {295, 1}, kSlots[1]});
    QCOMPARE(moved.count(), 3);
    QCOMPARE(moved.at(1).at(0).toPoint(), QPoint(220 - 15, 15));
    QCOMPARE(m_mixer->getDriver()->getPoint(), kSlots[1]);
    QCOMPARE(centre(handle), kSlots[1]);
    QVERIFY(qAbs(morph(1)->getValue() - 1.f) < 1e-4f && qAbs(morph(0)->getValue()) < 1e-4f);
    QVERIFY(!rkUndoStack->canPushItems());
    QCOMPARE(rkUndoStack->count(), entries + 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Shape Mixing"));
    rkUndoStack->undo();
    for (int i = 0; i < 4; ++i)
        QCOMPARE(morph(i)->getValue(), 0.25f);

    // A page closed in the middle of a drag keeps that drag as its entry.
    drag(page, {kSlots[1], kSlots[1] + QPoint(-30, 0)}, false);
    QVERIFY(rkUndoStack->canPushItems());
    delete page;
    QVERIFY(!rkUndoStack->canPushItems());
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Shape Mixing"));
    QTest::mouseRelease(m_window.get(), Qt::LeftButton, {}, kSlots[1] + QPoint(-30, 0));
}

void TestRkEzMixerWgt::thumbnailsMoveAndDelete()
{
    makeMixer(3, kSlots.mid(0, 3));
    RkEzMixerWgt* page = showPage(m_mixer);
    QVERIFY(page);
    QPointer<RkEzMixerControlWgt> wgt = page->getControlWgts()[1];
    QCOMPARE(wgt->geometry(), QRect(168 - 42, 127 - 42, 85, 85));
    // Only the opaque part of a thumbnail takes the mouse.
    QCOMPARE(page->childAt(kSlots[1] + QPoint(-30, 0)), wgt.data());
    QVERIFY(page->childAt(kSlots[1] + QPoint(-38, 0)) != wgt);
    const int entries = rkUndoStack->count();

    // Dragging re-places only that control: no drive, no undo entry.
    drag(page, {kSlots[1], kSlots[1] + QPoint(-10, 15), kSlots[1] + QPoint(-20, 30)});
    QCOMPARE(wgt->getControl()->getPoint(), kSlots[1] + QPoint(-20, 30));
    QCOMPARE(centre(wgt), kSlots[1] + QPoint(-20, 30));
    QCOMPARE(m_mixer->getControls()[0]->getPoint(), kSlots[0]);
    QCOMPARE(m_mixer->getControls()[2]->getPoint(), kSlots[2]);
    QCOMPARE(m_mixer->getDriver()->getPoint(), QPoint(105, 127));
    QCOMPARE(morph(1)->getValue(), 0.25f);

    // Deleting is not undoable either.
    QPointer<RkEzMixerControl> control = wgt->getControl();
    deleteThroughMenu(page, centre(wgt));
    QVERIFY(!m_mixer->getControls().contains(control));
    QCOMPARE(page->getControlWgts().size(), 2);
    QTRY_VERIFY(!wgt && !control);
    QCOMPARE(rkUndoStack->count(), entries);
}

// A thumbnail that is missing or clear throughout, or a morph that is gone, still leaves a box
// the user can see, move and delete.
void TestRkEzMixerWgt::controlsWithoutThumbnailOrMorph()
{
    QImage clear(85, 85, QImage::Format_ARGB32);
    clear.fill(Qt::transparent);
    makeMixer(3, kSlots.mid(0, 3), {{}, clear, {}});
    m_figure->removeProperty(morph(2));
    RkEzMixerWgt* page = showPage(m_mixer);
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
    QCOMPARE(m_mixer->getControls()[0]->getPoint(), kSlots[0] + QPoint(5, 5));
    deleteThroughMenu(page, kSlots[2]);
    QCOMPARE(m_mixer->getControls().size(), 2);
}

void TestRkEzMixerWgt::loadedMixerShowsItsControls()
{
    // An opaque thumbnail may load without an alpha channel: all of it takes the mouse.
    QImage opaque(85, 85, QImage::Format_RGB32);
    opaque.fill(Qt::darkCyan);
    const QVector<QPoint> points = {{30, 40}, {170, 60}, {100, 200}, {150, 150}};
    makeMixer(4, points);
    m_mixer->getControls()[2]->setImage(opaque);
    m_mixer->getControls()[3]->setImage(QImage());
    m_mixer->getDriver()->moveTo(120, 90);
    QTemporaryDir dir;
    QString error;
    QVERIFY2(rkScene->save(dir.filePath("mixer.rks"), &error), qPrintable(error));
    rkScene->clear();
    QVERIFY2(rkScene->load(dir.filePath("mixer.rks"), &error), qPrintable(error));

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
    makeMixer(10, {});
    RkEzMixer* second = RkEzMixerSetup::addMixer(m_figure);
    QCOMPARE(RkEzMixerSetup::findMixers(m_figure)->getMixers(),
             (QVector<RkEzMixer*>{m_mixer, second}));
    // A wide tile: only its centred square, blue, becomes the control's image.
    QImage tile(120, 90, QImage::Format_ARGB32);
    tile.fill(Qt::red);
    QPainter(&tile).fillRect(15, 0, 90, 90, Qt::blue);
    RkEzMixerWgt* page = showPage(second);
    QVERIFY(page);
    for (int i = 0; i < 10; ++i) {
        RkEzMixerControl* control =
            RkEzMixerSetup::addControl(second, morph(i), i < 9 ? tile : QImage());
        QCOMPARE(control->getPoint(), kSlots[i % 8]);
        QCOMPARE(control->getValue(), 1.f);
        RkEzMixerControlWgt* wgt = page->addControlWgt(control);
        QVERIFY(wgt->isVisible());
        QCOMPARE(centre(wgt), kSlots[i % 8]);
    }
    const QImage image = second->getControls()[0]->getImage();
    QCOMPARE(image.size(), QSize(85, 85));
    QCOMPARE(image.pixelColor(0, 42), QColor(Qt::blue));
    QVERIFY(second->getControls()[9]->getImage().isNull());
    QVERIFY(m_mixer->getControls().isEmpty());
}

RK_TEST_MAIN(TestRkEzMixerWgt)
#include "tst_rkezmixerwgt.moc"
