#include "app/rkmainwindow.h"
#include "demo/rkdemoscene.h"
#include "properties/rkfloatproperty.h"
#include "rkimportrunner.h"
#include "rkscenelist.h"
#include "rkscenemenus.h"
#include "rktestmain.h"
#include "scene/rkbone.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostack.h"
#include "undo/rkundostackhold.h"

#include "import/rkimporter.h"
#include "render/rk3dviewport.h"
#include "scene/rkobject.h"
#include "viewport/rkviewport.h"

#include <QAction>
#include <QMessageBox>
#include <QProgressDialog>
#include <QPushButton>
#include <QTemporaryDir>

class TestRkSceneMenus : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init();
    void cleanup();
    void undoRedoCarryTheirCaptions();
    void badFileKeepsTheSceneAndSaysWhy();
    void saveThenOpenBringsTheSceneBack();
    void sceneListSelects();
    void importSelectsAndFrames();
    void cancelledImportLeavesTheScene();
    void missingModelIsReportedOnOpen();

private:
    RkMainWindow* window = nullptr;
    RkSceneMenus* menus = nullptr;
    RkSceneList* list = nullptr;
    QTemporaryDir dir;
};

void TestRkSceneMenus::init()
{
    rkScene->clear();
    rkScene->setFileName(QString());
    window = new RkMainWindow;
    menus = new RkSceneMenus(window);
    list = rkAddSceneList(window);
    rkBuildDemoScene(rkScene);
    window->resize(900, 700);
    window->show();
    QVERIFY(QTest::qWaitForWindowExposed(window));
}

void TestRkSceneMenus::cleanup()
{
    delete window;
    window = nullptr;
}

void TestRkSceneMenus::undoRedoCarryTheirCaptions()
{
    auto* smile =
        qobject_cast<RkFloatProperty*>(rkScene->findNode(RkDemoFigureName)->findProperty("Smile"));
    QCOMPARE(menus->undoAction()->text(), QStringLiteral("&Undo"));
    QVERIFY(!menus->undoAction()->isEnabled());
    {
        RkUndoStackHold hold;
        smile->setValue(0.8f);
        hold.accept("Mixer Drag");
    }
    QCOMPARE(menus->undoAction()->text(), QStringLiteral("&Undo Mixer Drag"));
    QVERIFY(menus->undoAction()->isEnabled());
    menus->undoAction()->trigger();
    QCOMPARE(smile->getValue(), 0.0f);
    QCOMPARE(menus->undoAction()->text(), QStringLiteral("&Undo"));
    QCOMPARE(menus->redoAction()->text(), QStringLiteral("&Redo Mixer Drag"));
    menus->redoAction()->trigger();
    QCOMPARE(smile->getValue(), 0.8f);
    QVERIFY(!menus->redoAction()->isEnabled());
}

void TestRkSceneMenus::badFileKeepsTheSceneAndSaysWhy()
{
    const QString path = dir.filePath("broken.rks");
    QFile f(path);
    QVERIFY(f.open(QIODevice::WriteOnly));
    f.write("RKSCENE\x1a this is not a scene at all");
    f.close();
    const int nodes = rkScene->getNumNodes();
    QVERIFY(!menus->openScene(path));
    QCOMPARE(rkScene->getNumNodes(), nodes);
    auto* box = window->findChild<QMessageBox*>("SceneMessage");
    QVERIFY(box);
    QTRY_VERIFY(box->isVisible());
    QVERIFY2(box->text().contains("broken.rks") && box->text().contains("unchanged"),
             qPrintable(box->text()));
    QVERIFY2(box->text().contains("format version"), qPrintable(box->text()));
    box->close();
}

void TestRkSceneMenus::saveThenOpenBringsTheSceneBack()
{
    const QString path = dir.filePath("kept.rks");
    auto* smile =
        qobject_cast<RkFloatProperty*>(rkScene->findNode(RkDemoFigureName)->findProperty("Smile"));
    smile->setValue(0.4f);
    QVERIFY(menus->saveScene(path));
    QCOMPARE(window->windowTitle(), QStringLiteral("kept.rks - rkhost"));
    menus->newAction()->trigger();
    QCOMPARE(rkScene->getNumNodes(), 0);
    QCOMPARE(list->topLevelItemCount(), 0);
    QCOMPARE(window->windowTitle(), QStringLiteral("rkhost"));
    QVERIFY(menus->openScene(path));
    auto* loaded =
        qobject_cast<RkFloatProperty*>(rkScene->findNode(RkDemoFigureName)->findProperty("Smile"));
    QCOMPARE(loaded->getValue(), 0.4f);
    // The list shows the loaded scene: figure, prop, camera and light at the top.
    QCOMPARE(list->topLevelItemCount(), 4);
}

void TestRkSceneMenus::sceneListSelects()
{
    QTRY_VERIFY(list->topLevelItemCount() > 0);
    RkNode* camera = rkScene->findNode(RkDemoCameraName);
    RkNode* prop = rkScene->findNode(RkDemoPropName);
    QTreeWidgetItem* cameraItem = list->itemForNode(camera);
    QVERIFY(cameraItem);
    QTest::mouseClick(list->viewport(), Qt::LeftButton, {},
                      list->visualItemRect(cameraItem).center());
    QCOMPARE(rkScene->getPrimarySelection(), camera);

    QTest::mouseClick(list->viewport(), Qt::LeftButton, Qt::ControlModifier,
                      list->visualItemRect(list->itemForNode(prop)).center());
    QCOMPARE(rkScene->getSelectedNodes(), RkNodeList({camera, prop}));
    QVERIFY(list->itemForNode(prop)->font(0).bold());
    QVERIFY(!cameraItem->font(0).bold());

    // Selecting elsewhere shows in the list.
    auto* figure = qobject_cast<RkSkeleton*>(rkScene->findNode(RkDemoFigureName));
    rkScene->selectNode(figure->findBone("head"));
    QTreeWidgetItem* head = list->itemForNode(figure->findBone("head"));
    QVERIFY(head);
    QCOMPARE(head->background(0).color(), list->palette().color(QPalette::Highlight));
    QCOMPARE(cameraItem->background(0).style(), Qt::NoBrush);
}

namespace
{
const QString Figure = QStringLiteral("/usr/share/assimp/models/X/BCN_Epileptic.X");
}

void TestRkSceneMenus::importSelectsAndFrames()
{
    if (!QFile::exists(Figure))
        QSKIP("Debian's assimp-testmodels is not installed (scripts/setup.sh installs it)");
    auto* view = new Rk3DViewport;
    window->setSceneWidget(view);
    QCOMPARE(window->getMainViewport()->get3DViewport(), view);
    const float distance = view->getCamera().distance;
    QVERIFY(menus->importFile(Figure));
    RkNode* figure = rkScene->getPrimarySelection();
    QVERIFY(qobject_cast<RkSkeleton*>(figure));
    QCOMPARE(figure->getName(), QStringLiteral("BCN_Epileptic"));
    // Framed on the figure, which stands 1.6 units tall at the origin.
    const RkSceneRenderer::Camera camera = view->getCamera();
    QVERIFY(camera.distance != distance);
    QVERIFY(camera.target.y > 0.5f && camera.target.y < 1.2f);
    QVERIFY(std::fabs(camera.target.x) < 0.2f);
    QVERIFY(!window->findChild<QMessageBox*>("SceneMessage"));
    QTRY_COMPARE(list->topLevelItemCount(), 5);

    // A second import of the same file gets a name of its own; a refused one says why.
    QVERIFY(menus->importFile(Figure));
    QCOMPARE(rkScene->getPrimarySelection()->getName(), QStringLiteral("BCN_Epileptic 2"));
    const int nodes = rkScene->getNumNodes();
    QVERIFY(!menus->importFile(dir.filePath("nothing.gltf")));
    QCOMPARE(rkScene->getNumNodes(), nodes);
    auto* box = window->findChild<QMessageBox*>("SceneMessage");
    QVERIFY(box);
    QVERIFY2(box->text().contains("nothing.gltf") && box->text().contains("unchanged"),
             qPrintable(box->text()));
    box->close();
}

void TestRkSceneMenus::cancelledImportLeavesTheScene()
{
    if (!QFile::exists(Figure))
        QSKIP("Debian's assimp-testmodels is not installed (scripts/setup.sh installs it)");
    const QStringList before = [] {
        QStringList names;
        for (RkNode* n : rkScene->getNodes())
            names << n->getName();
        return names;
    }();
    RkImporter importer;
    RkImportRunner runner(window);
    runner.setDialogDelay(0);
    bool shown = false;
    connect(&runner, &RkImportRunner::dialogShown, this, [&] {
        shown = true;
        QProgressDialog* dialog = window->findChild<QProgressDialog*>("ImportProgress");
        QVERIFY(dialog && dialog->isVisible());
        QPushButton* cancel = dialog->findChild<QPushButton*>();
        QVERIFY(cancel);
        QTest::mouseClick(cancel, Qt::LeftButton);
    });
    QVERIFY(!runner.read(&importer, Figure));
    QVERIFY(shown);
    QVERIFY(runner.wasCancelled());
    QVERIFY(!runner.getDialog()->isVisible());
    QStringList after;
    for (RkNode* n : rkScene->getNodes())
        after << n->getName();
    QCOMPARE(after, before);
}

void TestRkSceneMenus::missingModelIsReportedOnOpen()
{
    const QString cube = QStringLiteral("/usr/share/assimp/models/OBJ/box.obj");
    if (!QFile::exists(cube))
        QSKIP("Debian's assimp-testmodels is not installed (scripts/setup.sh installs it)");
    QVERIFY(QFile::copy(cube, dir.filePath("crate.obj")));
    QVERIFY(menus->importFile(dir.filePath("crate.obj")));
    QVERIFY(menus->saveScene(dir.filePath("crate.rks")));
    const int nodes = rkScene->getNumNodes();
    QVERIFY(QFile::remove(dir.filePath("crate.obj")));
    rkScene->clear();
    // A scene picked for import opens as a scene.
    QVERIFY(menus->importFile(dir.filePath("crate.rks")));
    QCOMPARE(rkScene->getNumNodes(), nodes);
    QVERIFY(rkScene->findNode("crate"));
    QVERIFY(!rkScene->findNode("crate")->getObject());
    auto* box = window->findChild<QMessageBox*>("SceneMessage");
    QVERIFY(box);
    QTRY_VERIFY(box->isVisible());
    QVERIFY2(box->text().contains("crate.obj") && box->text().contains("missing"),
             qPrintable(box->text()));
    box->close();
}

RK_TEST_MAIN(TestRkSceneMenus)
#include "tst_rkscenemenus.moc"
