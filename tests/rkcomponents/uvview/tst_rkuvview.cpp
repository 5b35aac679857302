#include "demo/rkdemomesh.h"
#include "demo/rkdemoscene.h"
#include "plugin/rkpluginmgr.h"
#include "rkcomponentsplugin.h"
#include "rktestmain.h"
#include "rkuvset.h"
#include "rkuvview.h"
#include "rkuvviewaction.h"
#include "rkuvwgt.h"
#include "scene/rkbone.h"
#include "scene/rkmaterial.h"
#include "scene/rkobject.h"
#include "scene/rkscene.h"
#include "scene/rkshape.h"
#include "scene/rkskeleton.h"
#include "viewport/rkviewport.h"
#include "viewport/rkviewportmgr.h"
#include "widgets/rkmenubutton.h"

#include <QImageReader>
#include <QScriptEngine>
#include <QTemporaryDir>

namespace
{

// Counts the view's refresh events as they are delivered: one per rebuild.
class RefreshCounter : public QObject
{
public:
    explicit RefreshCounter(QObject* view) { view->installEventFilter(this); }
    int count = 0;

protected:
    bool eventFilter(QObject*, QEvent* event) override
    {
        if (event->type() == QEvent::Type(RkUVView::RefreshEvent))
            ++count;
        return false;
    }
};

RkMaterial* findMaterial(const QString& name)
{
    for (int i = 0; i < RkMaterial::getNumMaterials(); ++i) {
        if (RkMaterial::getMaterial(i)->getName() == name)
            return RkMaterial::getMaterial(i);
    }
    return nullptr;
}

int bonesWithGeometry(RkSkeleton* figure)
{
    QList<RkBone*> bones;
    figure->getAllBones(bones);
    int n = 0;
    for (RkBone* bone : bones)
        n += bone->getObject() && bone->getObject()->getGeometry() ? 1 : 0;
    return n;
}

} // namespace

class TestRkUVView : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void init();
    void modesAndToolBar();
    void byNode();
    void byMaterial();
    void coalescedRefreshes();
    void hiddenAndLoading();
    void deletedMaterialListener();
    void action();
    void exportLayout();

private:
    std::unique_ptr<RkMainWindow> m_window;
    std::unique_ptr<RkUVView> m_view;
    RkSkeleton* m_figure = nullptr;
};

void TestRkUVView::initTestCase()
{
    m_window = rkMakeTestMainWindow();
    QVERIFY(rkApp->getPluginMgr()->addPlugin(rkComponentsPlugin()));
    m_figure = rkBuildDemoScene(rkScene);
}

void TestRkUVView::init()
{
    rkScene->clearSelection();
    RkMaterial::clearMaterialSelection();
    m_view = std::make_unique<RkUVView>();
    m_view->resize(400, 300);
    m_view->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_view.get()));
    QCoreApplication::processEvents();
}

void TestRkUVView::modesAndToolBar()
{
    RkMenuButton* button = m_view->getModeButton();
    // The button picks its first item while the view is made: by material.
    QCOMPARE(m_view->getViewMode(), 0);
    m_view->changeViewMode(2);
    m_view->changeViewMode(-1);
    QCOMPARE(m_view->getViewMode(), 0);

    // There and back: the material selection is heard, the node selection is not.
    button->selectItemAt(1);
    QCOMPARE(m_view->getViewMode(), 1);
    button->selectItemAt(0);
    QCoreApplication::processEvents();
    QVERIFY(!disconnect(rkScene, &RkScene::nodeSelectionListChanged, m_view.get(),
                        &RkUVView::postRefreshEvent));
    QVERIFY(disconnect(rkScene, &RkScene::materialSelectionChanged, m_view.get(),
                       &RkUVView::postRefreshEvent));

    // Scripts construct the view by its class name.
    QScriptValue made = rkApp->getScriptEngine()->evaluate(QStringLiteral("new RkUVView()"));
    std::unique_ptr<QObject> fromScript(made.toQObject());
    QVERIFY(qobject_cast<RkUVView*>(fromScript.get()));
}

void TestRkUVView::byNode()
{
    m_view->changeViewMode(1);
    const int bones = bonesWithGeometry(m_figure);
    QVERIFY(bones >= 10);

    // A figure counts as its bones; a bone selected with it is listed once.
    QList<RkBone*> all;
    m_figure->getAllBones(all);
    RkBone* head = m_figure->findBone(QStringLiteral("head"));
    QVERIFY(head);
    rkScene->selectNode(head);
    rkScene->selectNode(m_figure, true);
    QCoreApplication::processEvents();
    QCOMPARE(m_view->getUVWgt()->getUVSets().size(), bones);

    rkScene->selectNode(head);
    QCoreApplication::processEvents();
    QCOMPARE(m_view->getUVWgt()->getUVSets().size(), 1);
    QVERIFY(m_view->getUVWgt()->getUVSets().first()->getNumPolygons() > 0);

    // Changed UVs of a listed node rebuild the view.
    RefreshCounter counter(m_view.get());
    Q_EMIT head->uvsChanged();
    QVERIFY(m_view->isRefreshPending());
    QCoreApplication::processEvents();
    QCOMPARE(counter.count, 1);
}

void TestRkUVView::byMaterial()
{
    RkMaterial* skin = findMaterial(QStringLiteral("Skin"));
    RkMaterial* eyes = findMaterial(QStringLiteral("Eyes"));
    QVERIFY(skin && eyes);
    eyes->setSelected(true);
    skin->setSelected(true);
    QCoreApplication::processEvents();
    // One record per shape with geometry using the material, materials in their scene order:
    // first Skin's (its index in the bones' shapes), then those of Eyes.
    const QList<RkUVSet*> sets = m_view->getUVWgt()->getUVSets();
    QVERIFY(sets.size() > 2);
    QList<int> shown;
    for (const RkUVSet* set : sets) {
        QCOMPARE(set->getMaterials().count(), 1);
        shown.append(set->getMaterials()[0]);
    }
    QCOMPARE(shown.first(), int(RkDemoMesh::Skin));
    QCOMPARE(shown.last(), int(RkDemoMesh::Eyes));
    QVERIFY(std::is_sorted(shown.begin(), shown.end()));

    // Only selected materials count.
    eyes->setSelected(false);
    QCoreApplication::processEvents();
    for (const RkUVSet* set : m_view->getUVWgt()->getUVSets())
        QCOMPARE(set->getMaterials()[0], int(RkDemoMesh::Skin));
}

void TestRkUVView::coalescedRefreshes()
{
    m_view->changeViewMode(1);
    QCoreApplication::processEvents();
    RefreshCounter counter(m_view.get());
    QList<RkBone*> bones;
    m_figure->getAllBones(bones);
    for (int i = 0; i < 10; ++i)
        rkScene->selectNode(bones.at(i), true);
    QCoreApplication::processEvents();
    QCOMPARE(counter.count, 1);
    QCOMPARE(m_view->getUVWgt()->getUVSets().size(), 10);
}

void TestRkUVView::hiddenAndLoading()
{
    m_view->changeViewMode(1);
    QCoreApplication::processEvents();
    RefreshCounter counter(m_view.get());

    // Hidden: nothing is posted, but the change is shown once the view is back.
    m_view->hide();
    rkScene->selectNode(m_figure->findBone(QStringLiteral("head")));
    QVERIFY(!m_view->isRefreshPending());
    QCoreApplication::processEvents();
    QCOMPARE(counter.count, 0);
    m_view->show();
    QCoreApplication::processEvents();
    QCOMPARE(counter.count, 1);
    QCOMPARE(m_view->getUVWgt()->getUVSets().size(), 1);

    // A load: nothing while it runs, one refresh at the end.
    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("scene.rks"));
    QVERIFY(rkScene->save(path));
    int duringLoad = -1;
    connect(rkScene, &RkScene::sceneLoaded, m_view.get(), [&] { duringLoad = counter.count; });
    QVERIFY(rkScene->load(path));
    QCoreApplication::processEvents();
    QCOMPARE(duringLoad, 1);
    QCOMPARE(counter.count, 2);
    m_figure = qobject_cast<RkSkeleton*>(rkScene->findNode(QLatin1String(RkDemoFigureName)));
    QVERIFY(m_figure);
}

void TestRkUVView::deletedMaterialListener()
{
    // A material that goes while its node stays: the next refresh must not touch it.
    auto* material = new RkMaterial(QStringLiteral("Loose"));
    auto* node = new RkNode;
    auto* object = new RkObject(QStringLiteral("Loose"));
    auto* shape = new RkShape;
    shape->addMaterial(material);
    object->addShape(shape);
    node->setObject(object);
    rkScene->addNode(node);
    material->setSelected(true);
    QCoreApplication::processEvents();
    delete material;
    QCoreApplication::processEvents();
    RkMaterial* skin = findMaterial(QStringLiteral("Skin"));
    skin->setSelected(true);
    QCoreApplication::processEvents();
    QVERIFY(!m_view->getUVWgt()->getUVSets().isEmpty());
    rkScene->removeNode(node);
}

void TestRkUVView::action()
{
    RkUVViewAction action;
    RkViewport* viewport = m_window->getViewportMgr()->getActiveViewport();
    action.trigger();
    QVERIFY(qobject_cast<RkUVView*>(viewport->getView()));
    viewport->setView(nullptr);

    // Without a main window no view is made for nobody.
    m_window.reset();
    auto views = [] {
        int n = 0;
        for (QWidget* w : QApplication::allWidgets())
            n += qobject_cast<RkUVView*>(w) ? 1 : 0;
        return n;
    };
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    const int before = views();
    action.trigger();
    QCOMPARE(views(), before);
    m_window = rkMakeTestMainWindow();
}

void TestRkUVView::exportLayout()
{
    m_view->changeViewMode(1);
    rkScene->selectNode(m_figure);
    QCoreApplication::processEvents();
    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("layout.png"));
    QVERIFY(m_view->exportLayout(path, 600));
    QImage image(path);
    QCOMPARE(image.size(), QSize(600, 600));
    QVERIFY(image.hasAlphaChannel());
    // The unit square's side is the picture's edge; the figure's islands leave gaps.
    QCOMPARE(qAlpha(image.pixel(300, 0)), 255);
    int transparent = 0;
    for (int y = 0; y < 600; y += 7)
        transparent += qAlpha(image.pixel(301, y)) == 0 ? 1 : 0;
    QVERIFY(transparent > 10);

    // Sizes stay in range; an unwritable place is refused with a message naming it.
    QVERIFY(m_view->exportLayout(path, 100));
    QCOMPARE(QImageReader(path).size(), QSize(512, 512));
    QString error;
    const QString bad = dir.filePath(QStringLiteral("missing/layout.png"));
    QVERIFY(!m_view->exportLayout(bad, 1024, &error));
    QVERIFY2(error.contains(bad), qPrintable(error));
}

RK_TEST_MAIN(TestRkUVView)
#include "tst_rkuvview.moc"
