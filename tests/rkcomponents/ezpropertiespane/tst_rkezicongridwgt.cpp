#include "app/rkmainwindow.h"
#include "demo/rkdemoscene.h"
#include "properties/rkfloatproperty.h"
#include "render/rk3dviewport.h"
#include "rkezicongridwgt.h"
#include "rkezimagerenderhandler.h"
#include "rkezpropertiescontrol.h"
#include "rkezpropertiesdragger.h"
#include "rktestmain.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostack.h"
#include "undo/rkundostackhold.h"

#include <QGridLayout>
#include <QTimer>

namespace
{

// Morphs of the demo figure that change its outline enough to show in a small thumbnail.
const char* const kMorphs[] = {"BodyHeavy",     "LegsLong",  "ArmsLong",    "HeadLong",
                               "ShouldersWide", "EarsLarge", "Belly",       "ThighsHeavy",
                               "BodyThin",      "FeetLarge", "ArmsMuscular"};

int g_viewportWarnings = 0;
QtMessageHandler g_previousHandler = nullptr;

void countViewportWarnings(QtMsgType type, const QMessageLogContext& context, const QString& text)
{
    if (text.contains(QLatin1String("No active 3D viewport")))
        ++g_viewportWarnings;
    else
        g_previousHandler(type, context, text);
}

int coveredPixels(const QImage& image, const QColor& background)
{
    int n = 0;
    for (int y = 0; y < image.height(); ++y) {
        for (int x = 0; x < image.width(); ++x) {
            const QColor c = image.pixelColor(x, y);
            n += std::abs(c.red() - background.red()) + std::abs(c.green() - background.green()) +
                     std::abs(c.blue() - background.blue()) >
                 12;
        }
    }
    return n;
}

} // namespace

class TestRkEzIconGridWgt : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init();
    void cleanup();
    void tilesAroundTheHandle();
    void thumbnailsRenderAndLeaveNoTrace();
    void handlerDestroyedMidRenderTakesItsChangesBack();
    void noViewportWarnsOnce();
    void hiddenGridAndHeldStackPauseTheMaking();
    void removedMorphIsSkipped();

private:
    QVector<RkProperty*> morphs(int n) const;
    QList<float> cameraValues() const;
    bool makeAll();

    std::unique_ptr<RkMainWindow> m_window;
    Rk3DViewport* m_view = nullptr;
    RkSkeleton* m_figure = nullptr;
    std::unique_ptr<RkEzIconGridWgt> m_grid;
};

void TestRkEzIconGridWgt::init()
{
    rkScene->clear();
    m_figure = rkBuildDemoScene(rkScene);
    rkScene->selectNode(m_figure);
    m_window = rkMakeTestMainWindow();
    m_view = new Rk3DViewport;
    m_window->setSceneWidget(m_view);
    m_window->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_window.get()));
    m_grid = std::make_unique<RkEzIconGridWgt>(nullptr, nullptr);
    m_grid->resize(300, 360);
}

void TestRkEzIconGridWgt::cleanup()
{
    m_grid.reset();
    m_window.reset();
    rkUndoStack->clear();
    rkScene->clear();
}

QVector<RkProperty*> TestRkEzIconGridWgt::morphs(int n) const
{
    QVector<RkProperty*> set;
    for (int i = 0; i < n; ++i)
        set.append(m_figure->findProperty(QString::fromLatin1(kMorphs[i])));
    return set;
}

QList<float> TestRkEzIconGridWgt::cameraValues() const
{
    QList<float> values;
    for (const RkFloatProperty* p : m_view->getCameraProperties())
        values.append(p->getValue());
    return values;
}

bool TestRkEzIconGridWgt::makeAll()
{
    m_grid->scheduleMakeImages();
    return QTest::qWaitFor([this] { return !m_grid->getTimer()->isActive(); }, 20000);
}

void TestRkEzIconGridWgt::tilesAroundTheHandle()
{
    // Three morphs fill the top row; the handle lies over the centre cell, also after a resize.
    m_grid->addProperties(morphs(3));
    m_grid->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_grid.get()));
    const QVector<RkEzPropertiesControl*> tiles = m_grid->getTiles();
    QCOMPARE(tiles.size(), 3);
    auto* layout = m_grid->findChild<QGridLayout*>();
    for (int i = 0; i < 3; ++i)
        QCOMPARE(tiles[i]->geometry(), layout->cellRect(0, i));
    QVERIFY(layout->cellRect(1, 1).isValid());
    QCOMPARE(m_grid->getDragger()->geometry(), layout->cellRect(1, 1));
    m_grid->resize(420, 500);
    QTRY_COMPARE(m_grid->getDragger()->geometry(), layout->cellRect(1, 1));
    QVERIFY(m_grid->getDragger()->width() > 100);

    // The second page of eleven shows the last three.
    const QPointer<RkEzPropertiesControl> oldTile = tiles[0];
    m_grid->clear();
    m_grid->setFirst(8);
    m_grid->addProperties(morphs(11));
    QCOMPARE(m_grid->getTiles().size(), 3);
    QCOMPARE(m_grid->getTiles()[0]->getProperty()->getName(), QStringLiteral("BodyThin"));
    QCOMPARE(m_grid->getTiles()[2]->getProperty()->getName(), QStringLiteral("ArmsMuscular"));
    QVERIFY(oldTile);
    QTRY_VERIFY(!oldTile); // the old tiles go after the current event
}

void TestRkEzIconGridWgt::thumbnailsRenderAndLeaveNoTrace()
{
    m_grid->addProperties(morphs(8));
    m_grid->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_grid.get()));
    RkSceneRenderer::Camera far = m_view->getCamera();
    far.distance = 40;
    far.yaw = 30;
    m_view->setCamera(far);
    const QList<float> camera = cameraValues();
    const int entries = rkUndoStack->count();
    const QString caption = rkUndoStack->getUndoCaption();
    // A hover preview on the last tile is stopped for each render and runs again afterwards.
    RkEzPropertiesControl* hovered = m_grid->getTiles().last();
    auto* hoveredMorph = static_cast<RkFloatProperty*>(morphs(8).last());
    hovered->setPointerOverImage(true);
    hovered->beginPreview();
    QCOMPARE(hoveredMorph->getValue(), 1.f);

    QVERIFY(makeAll());
    const QVector<RkEzPropertiesControl*> tiles = m_grid->getTiles();
    for (RkEzPropertiesControl* tile : tiles) {
        const QImage image = tile->getImage();
        QCOMPARE(image.size(), tile->getImageSize());
        QVERIFY2(coveredPixels(image, m_view->getBackground()) >
                     image.width() * image.height() / 20,
                 qPrintable(tile->getProperty()->getName()));
    }
    QVERIFY(tiles[0]->getImage() != tiles[1]->getImage());

    QVERIFY(hovered->isPreviewing());
    QCOMPARE(hoveredMorph->getValue(), 1.f);
    hovered->endPreview();
    for (RkProperty* p : morphs(8))
        QCOMPARE(static_cast<RkFloatProperty*>(p)->getValue(), 0.f);
    QCOMPARE(cameraValues(), camera);
    QCOMPARE(rkUndoStack->count(), entries);
    QCOMPARE(rkUndoStack->getUndoCaption(), caption);
    QVERIFY(!rkUndoStack->canPushItems());
}

void TestRkEzIconGridWgt::handlerDestroyedMidRenderTakesItsChangesBack()
{
    m_grid->addProperties(morphs(1));
    m_grid->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_grid.get()));
    RkEzPropertiesControl* tile = m_grid->getTiles().first();
    auto* morph = static_cast<RkFloatProperty*>(tile->getProperty());
    const QList<float> camera = cameraValues();
    const int entries = rkUndoStack->count();
    {
        RkEzImageRenderHandler handler(m_view, tile, QSize(64, 64), 0);
        handler.renderStarting();
        handler.frameStarting(0);
        QCOMPARE(morph->getValue(), 1.f);
        QVERIFY(cameraValues() != camera);
    }
    QVERIFY(!rkUndoStack->canPushItems());
    QVERIFY(!tile->isPreviewing());
    QCOMPARE(morph->getValue(), 0.f);
    QCOMPARE(cameraValues(), camera);
    QCOMPARE(rkUndoStack->count(), entries);
}

void TestRkEzIconGridWgt::noViewportWarnsOnce()
{
    m_window->setSceneWidget(new QWidget);
    m_grid->addProperties(morphs(8));
    m_grid->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_grid.get()));
    g_viewportWarnings = 0;
    g_previousHandler = qInstallMessageHandler(countViewportWarnings);
    const bool stopped = makeAll();
    QTest::qWait(50);
    qInstallMessageHandler(g_previousHandler);
    QVERIFY(stopped);
    QCOMPARE(g_viewportWarnings, 1);
    for (RkEzPropertiesControl* tile : m_grid->getTiles())
        QVERIFY(tile->getImage().isNull());
}

void TestRkEzIconGridWgt::hiddenGridAndHeldStackPauseTheMaking()
{
    m_grid->addProperties(morphs(8));
    m_grid->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_grid.get()));
    const QVector<RkEzPropertiesControl*> tiles = m_grid->getTiles();

    // Hidden: nothing runs; shown again: the making goes on.
    m_grid->hide();
    m_grid->scheduleMakeImages();
    QVERIFY(!m_grid->getTimer()->isActive());
    QTest::qWait(30);
    QVERIFY(tiles[0]->getImage().isNull());
    m_grid->show();
    QVERIFY(m_grid->getTimer()->isActive());
    QTRY_VERIFY(!tiles[7]->getImage().isNull());
    QTRY_VERIFY(!m_grid->getTimer()->isActive());

    // Another edit holds the stack: the making looks again now and then, and goes on when the
    // hold ends.
    for (RkEzPropertiesControl* tile : tiles)
        tile->setImage(QImage());
    auto hold = std::make_unique<RkUndoStackHold>();
    m_grid->scheduleMakeImages();
    QTest::qWait(250);
    QVERIFY(m_grid->getTimer()->isActive());
    QVERIFY(m_grid->getTimer()->interval() >= 50);
    QVERIFY(tiles[0]->getImage().isNull());
    hold->cancel();
    hold.reset();
    QTRY_VERIFY(!tiles[7]->getImage().isNull());
    QCOMPARE(m_grid->getTimer()->interval(), 0);
}

void TestRkEzIconGridWgt::removedMorphIsSkipped()
{
    m_grid->addProperties(morphs(3));
    m_grid->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_grid.get()));
    const QVector<RkEzPropertiesControl*> tiles = m_grid->getTiles();
    RkProperty* gone = tiles[1]->getProperty();
    m_figure->removeProperty(gone);
    QVERIFY(makeAll());
    QVERIFY(!tiles[0]->getImage().isNull());
    QVERIFY(tiles[1]->getImage().isNull());
    QVERIFY(!tiles[2]->getImage().isNull());
}

RK_TEST_MAIN(TestRkEzIconGridWgt)
#include "tst_rkezicongridwgt.moc"
