#include "demo/rkdemoscene.h"
#include "properties/rkfloatproperty.h"
#include "render/rk3dviewport.h"
#include "render/rkimagerenderhandler.h"
#include "render/rkrenderdata.h"
#include "rktestmain.h"
#include "scene/rkbone.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostack.h"
#include "undo/rkundostackhold.h"
#include "viewport/rkviewport.h"

#include <QSignalSpy>

namespace
{

// Records the order of the callbacks and keeps the frame, as a thumbnail maker would.
class RecordingHandler : public RkImageRenderHandler
{
public:
    RecordingHandler(const QSize& size) : RkImageRenderHandler(size, 0, QString()) {}
    QStringList calls;
    std::function<void()> onFrameStarting;

    void renderStarting() override
    {
        calls << QStringLiteral("renderStarting");
        RkImageRenderHandler::renderStarting();
    }
    void frameStarting(int frame) override
    {
        calls << QStringLiteral("frameStarting(%1)").arg(frame);
        if (onFrameStarting)
            onFrameStarting();
    }
    void renderStep() override { calls << QStringLiteral("renderStep"); }
    bool takeFrameData(const RkRenderData* data) override
    {
        calls << QStringLiteral("takeFrameData");
        return RkImageRenderHandler::takeFrameData(data);
    }
    void renderFinished() override
    {
        calls << QStringLiteral("renderFinished");
        RkImageRenderHandler::renderFinished();
    }
};

// Pixels that differ from the background by more than a little.
int coveredPixels(const QImage& image, const QColor& background)
{
    int n = 0;
    for (int y = 0; y < image.height(); ++y) {
        for (int x = 0; x < image.width(); ++x) {
            const QColor c = image.pixelColor(x, y);
            if (std::abs(c.red() - background.red()) + std::abs(c.green() - background.green()) +
                    std::abs(c.blue() - background.blue()) >
                12)
                ++n;
        }
    }
    return n;
}

int differentPixels(const QImage& a, const QImage& b)
{
    int n = 0;
    for (int y = 0; y < a.height(); ++y) {
        for (int x = 0; x < a.width(); ++x)
            n += a.pixel(x, y) != b.pixel(x, y);
    }
    return n;
}

} // namespace

class TestRk3DViewport : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init();
    void cleanup();
    void rendersThroughTheHandlerInOrder();
    void morphsAndPoseChangeThePicture();
    void refusesRendersItCannotMake();
    void cancelledHoldTakesFramingBack();
    void clickSelectsAndDragOrbits();
    void viewportHandsOutItsScenePicture();

private:
    QImage render(const QSize& size = QSize(96, 96));
    std::unique_ptr<Rk3DViewport> m_view;
    RkSkeleton* m_figure = nullptr;
};

void TestRk3DViewport::init()
{
    rkScene->clear();
    m_figure = rkBuildDemoScene(rkScene);
    m_view = std::make_unique<Rk3DViewport>();
    m_view->resize(400, 300);
}

void TestRk3DViewport::cleanup()
{
    m_view.reset();
    rkScene->clear();
}

QImage TestRk3DViewport::render(const QSize& size)
{
    RkImageRenderHandler handler(size, 0, QString());
    handler.setBackColor(m_view->getBackground());
    if (!m_view->hardwareRender(&handler))
        return QImage();
    return handler.getImage();
}

void TestRk3DViewport::rendersThroughTheHandlerInOrder()
{
    QVERIFY(m_view->canHardwareRender());
    rkScene->selectNode(m_figure); // a thumbnail frames the figure
    m_view->frameCamera();
    RecordingHandler handler(QSize(96, 80));
    handler.setBackColor(m_view->getBackground());
    QVERIFY(m_view->hardwareRender(&handler));
    QCOMPARE(handler.calls, QStringList({"renderStarting", "frameStarting(0)", "renderStep",
                                         "takeFrameData", "renderFinished"}));
    const QImage image = handler.getImage();
    QCOMPARE(image.size(), QSize(96, 80));
    // The figure fills a good part of the picture, and the corners show the background.
    const int covered = coveredPixels(image, m_view->getBackground());
    QVERIFY2(covered > 96 * 80 / 10, qPrintable(QString::number(covered)));
    QCOMPARE(image.pixelColor(0, 0).rgb(), m_view->getBackground().rgb());

    // Two frames and a crop window: every frame is handed over, at the crop window's place.
    RecordingHandler cropped(QSize(64, 64));
    cropped.setBackColor(m_view->getBackground());
    cropped.setNumFrames(2);
    cropped.setCropWindow(QRect(16, 8, 32, 40));
    QVERIFY(m_view->hardwareRender(&cropped));
    QCOMPARE(cropped.calls.count(QStringLiteral("takeFrameData")), 2);
    QCOMPARE(cropped.calls.last(), QStringLiteral("renderFinished"));
    QCOMPARE(cropped.getImage().pixel(0, 0), 0u); // outside the crop window: untouched
    QVERIFY(cropped.getImage().pixel(20, 10) != 0u);
}

void TestRk3DViewport::morphsAndPoseChangeThePicture()
{
    rkScene->selectNode(m_figure);
    m_view->frameCamera();
    const QImage plain = render();
    QVERIFY(!plain.isNull());
    QCOMPARE(differentPixels(plain, render()), 0); // the same scene draws the same picture

    // Each region's morph at full strength changes the picture; back at 0 it is as before.
    for (const char* name : {"HeadLong", "EarsLarge", "BodyHeavy", "ArmsMuscular", "FeetLarge"}) {
        auto* morph = qobject_cast<RkFloatProperty*>(m_figure->findProperty(name));
        QVERIFY2(morph, name);
        morph->setValue(1.0f);
        const int changed = differentPixels(plain, render());
        QVERIFY2(changed > 5, qPrintable(QStringLiteral("%1: %2").arg(name).arg(changed)));
        morph->setValue(0.0f);
    }
    QCOMPARE(differentPixels(plain, render()), 0);

    // Raising the left arm moves it: pixels change around where the arm was.
    RkBone* shoulder = m_figure->findBone(QStringLiteral("lShldr"));
    QVERIFY(shoulder);
    shoulder->getZRotate()->setValue(60.0f);
    QVERIFY(differentPixels(plain, render()) > 30);

    // A morph set from inside the render (as a thumbnail maker does in frameStarting) shows.
    shoulder->getZRotate()->setValue(0.0f);
    RecordingHandler handler(QSize(96, 96));
    handler.setBackColor(m_view->getBackground());
    auto* belly = qobject_cast<RkFloatProperty*>(m_figure->findProperty("Belly"));
    handler.onFrameStarting = [belly] { belly->setValue(1.0f); };
    QVERIFY(m_view->hardwareRender(&handler));
    QVERIFY(differentPixels(plain, handler.getImage()) > 5);
}

void TestRk3DViewport::refusesRendersItCannotMake()
{
    for (const QSize& size : {QSize(0, 10), QSize(-5, -5), QSize(20000, 16)}) {
        RecordingHandler handler(size);
        QVERIFY(!m_view->hardwareRender(&handler));
        QVERIFY(handler.calls.isEmpty());
    }
    QVERIFY(!m_view->hardwareRender(nullptr));
}

void TestRk3DViewport::cancelledHoldTakesFramingBack()
{
    RkSceneRenderer::Camera far;
    far.yaw = 30;
    far.pitch = 10;
    far.distance = 40;
    far.target = RkVec3(5, 5, 5);
    m_view->setCamera(far);

    {
        RkUndoStackHold hold;
        QVERIFY(rkUndoStack->canPushItems());
        rkScene->selectNode(m_figure->findBone(QStringLiteral("head")));
        m_view->frameCamera();
        const RkSceneRenderer::Camera framed = m_view->getCamera();
        // Framed on the head: target in the head, close by, same turn.
        QVERIFY(std::fabs(framed.target.y - 1.69f) < 0.08f);
        QVERIFY(framed.distance < 2.0f);
        QCOMPARE(framed.yaw, 30.0f);
        hold.cancel();
    }
    const RkSceneRenderer::Camera back = m_view->getCamera();
    QCOMPARE(back.distance, 40.0f);
    QCOMPARE(back.target.x, 5.0f);
    QVERIFY(rkUndoStack->getUndoCaption().isEmpty());

    // With nothing selected the whole scene is framed: figure and prop.
    rkScene->clearSelection();
    m_view->frameCamera();
    const RkSceneRenderer::Camera all = m_view->getCamera();
    QVERIFY(all.target.y > 0.6f && all.target.y < 1.2f);
    QVERIFY(all.distance > 2.0f && all.distance < 8.0f);
}

void TestRk3DViewport::clickSelectsAndDragOrbits()
{
    m_view->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_view.get()));
    rkScene->selectNode(m_figure);
    m_view->frameCamera();
    rkScene->clearSelection();

    // The middle of the framed figure is its body: a click there selects one of its bones.
    QSignalSpy selection(rkScene, &RkScene::nodeSelectionListChanged);
    QTest::mouseClick(m_view.get(), Qt::LeftButton, Qt::NoModifier, m_view->rect().center());
    QCOMPARE(selection.count(), 1);
    RkNode* picked = rkScene->getPrimarySelection();
    QVERIFY(picked);
    QCOMPARE(picked->getSkeleton(), m_figure);
    const QString pickedName = picked->getName();
    QVERIFY2(QStringList({"hip", "abdomen", "chest"}).contains(pickedName), qPrintable(pickedName));

    // A click on empty space clears the selection.
    QTest::mouseClick(m_view.get(), Qt::LeftButton, Qt::NoModifier, QPoint(3, 3));
    QCOMPARE(rkScene->getNumSelectedNodes(), 0);

    // A drag turns the camera and selects nothing.
    const float yaw = m_view->getCamera().yaw;
    QTest::mousePress(m_view.get(), Qt::LeftButton, Qt::NoModifier, QPoint(100, 100));
    QMouseEvent move(QEvent::MouseMove, QPointF(160, 100), Qt::NoButton, Qt::LeftButton,
                     Qt::NoModifier);
    QApplication::sendEvent(m_view.get(), &move);
    QTest::mouseRelease(m_view.get(), Qt::LeftButton, Qt::NoModifier, QPoint(160, 100));
    QVERIFY(std::fabs(m_view->getCamera().yaw - (yaw - 24.0f)) < 0.01f);
    QCOMPARE(rkScene->getNumSelectedNodes(), 0);

    // Rolling the wheel forwards comes closer.
    const float distance = m_view->getCamera().distance;
    QWheelEvent wheel(QPointF(100, 100), QPointF(m_view->mapToGlobal(QPoint(100, 100))), QPoint(),
                      QPoint(0, 120), Qt::NoButton, Qt::NoModifier, Qt::NoScrollPhase, false);
    QApplication::sendEvent(m_view.get(), &wheel);
    QVERIFY(m_view->getCamera().distance < distance);
}

void TestRk3DViewport::viewportHandsOutItsScenePicture()
{
    RkViewport viewport;
    QVERIFY(!viewport.get3DViewport());
    viewport.setViewWidget(new QWidget);
    QVERIFY(!viewport.get3DViewport()); // some other picture
    auto* view = new Rk3DViewport;
    viewport.setViewWidget(view);
    QCOMPARE(viewport.get3DViewport(), view);
}

RK_TEST_MAIN(TestRk3DViewport)
#include "tst_rk3dviewport.moc"
