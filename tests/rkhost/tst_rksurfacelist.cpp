#include "actions/rkaction.h"
#include "actions/rkactionmgr.h"
#include "app/rkmainwindow.h"
#include "demo/rkdemoscene.h"
#include "geometry/rkgeometry.h"
#include "geometry/rkmap.h"
#include "rkhostactions.h"
#include "rksurfacelist.h"
#include "rktestmain.h"
#include "scene/rkbone.h"
#include "scene/rkmaterial.h"
#include "scene/rkobject.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "viewport/rkview.h"
#include "viewport/rkviewport.h"

#include <QMenu>

// The host's Surfaces dock and the host actions the UV view needs: back to the 3D picture, and a
// UV change that reaches the signals.
class TestRkSurfaceList : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void clicksSelectMaterials();
    void threeDViewComesBack();
    void flipUVsSignals();
    void cleanupTestCase();

private:
    QTreeWidgetItem* item(const QString& text) const;
    void click(const QString& text, Qt::KeyboardModifiers modifiers = Qt::NoModifier);
    QAction* action(const QString& text) const;

    RkMainWindow* window = nullptr;
    RkSurfaceList* list = nullptr;
    RkSkeleton* figure = nullptr;
};

void TestRkSurfaceList::initTestCase()
{
    window = new RkMainWindow;
    list = rkAddSurfaceList(window);
    figure = rkBuildDemoScene(rkScene);
    rkAddHostActions(window);
    window->getActionMgr()->buildMenus();
    window->resize(900, 700);
    window->show();
    QVERIFY(QTest::qWaitForWindowExposed(window));
    QCoreApplication::processEvents();
}

void TestRkSurfaceList::cleanupTestCase()
{
    delete window;
}

QTreeWidgetItem* TestRkSurfaceList::item(const QString& text) const
{
    const auto found = list->findItems(text, Qt::MatchExactly | Qt::MatchRecursive);
    return found.isEmpty() ? nullptr : found.first();
}

void TestRkSurfaceList::click(const QString& text, Qt::KeyboardModifiers modifiers)
{
    QTreeWidgetItem* it = item(text);
    QVERIFY2(it, qPrintable(text));
    list->scrollToItem(it);
    QTest::mouseClick(list->viewport(), Qt::LeftButton, modifiers,
                      list->visualItemRect(it).center());
}

QAction* TestRkSurfaceList::action(const QString& text) const
{
    for (RkAction* a : window->getActionMgr()->getActions()) {
        if (a->text() == text)
            return a;
    }
    return nullptr;
}

void TestRkSurfaceList::clicksSelectMaterials()
{
    // The figure's four materials once, under the figure; the prop's under the prop.
    QTreeWidgetItem* skin = item(QStringLiteral("Skin"));
    QVERIFY(skin);
    QCOMPARE(skin->parent()->text(0), figure->getLabel());
    QCOMPARE(skin->parent()->childCount(), 4);
    QVERIFY(item(QStringLiteral("Ball")));

    QSignalSpy changes(rkScene, &RkScene::materialSelectionChanged);
    click(QStringLiteral("Skin"));
    QCOMPARE(RkMaterial::getSelectedMaterials(), {list->materialForItem(skin)});
    QVERIFY(changes.count() >= 1);
    QCOMPARE(skin->background(0).color(), list->palette().color(QPalette::Highlight));

    click(QStringLiteral("Eyes"), Qt::ControlModifier);
    QCOMPARE(RkMaterial::getSelectedMaterials().size(), 2);
    click(QStringLiteral("Skin"), Qt::ControlModifier);
    QCOMPARE(RkMaterial::getSelectedMaterials().size(), 1);
    QCOMPARE(RkMaterial::getSelectedMaterials().first()->getName(), QStringLiteral("Eyes"));
    QCOMPARE(skin->background(0).style(), Qt::NoBrush);

    // A plain click replaces the selection; a click on nothing clears it.
    click(QStringLiteral("Trousers"));
    QCOMPARE(RkMaterial::getSelectedMaterials().size(), 1);
    QTest::mouseClick(list->viewport(), Qt::LeftButton, Qt::NoModifier,
                      QPoint(5, list->viewport()->height() - 3));
    QVERIFY(RkMaterial::getSelectedMaterials().isEmpty());
}

void TestRkSurfaceList::threeDViewComesBack()
{
    RkViewport* viewport = window->getMainViewport();
    QWidget* picture = new QWidget;
    viewport->setViewWidget(picture);
    viewport->setView(new RkView(QStringLiteral("SomeView")));
    QVERIFY(viewport->getView());
    QAction* back = action(QStringLiteral("3D View"));
    QVERIFY(back);
    QMenu* view = window->getActionMgr()->findMenu(QStringLiteral("&View"), false);
    QVERIFY(view && view->actions().contains(back));
    back->trigger();
    QVERIFY(!viewport->getView());
    QVERIFY(picture->isVisibleTo(viewport));
}

void TestRkSurfaceList::flipUVsSignals()
{
    RkBone* head = figure->findBone(QStringLiteral("head"));
    RkGeometry* geometry = head->getObject()->getGeometry();
    const RkPnt2 first = geometry->getUVs()->getPnt2(0);
    rkScene->selectNode(head);
    QSignalSpy uvs(head, &RkNode::uvsChanged);
    action(QStringLiteral("Flip UVs of Selection"))->trigger();
    QCOMPARE(uvs.count(), 1);
    QVERIFY(geometry->getUVs()->getPnt2(0).x != first.x);
    QCOMPARE(geometry->getUVs()->getPnt2(0).y, first.y);
    action(QStringLiteral("Flip UVs of Selection"))->trigger();
    QCOMPARE(geometry->getUVs()->getPnt2(0).x, first.x);
}

RK_TEST_MAIN(TestRkSurfaceList)
#include "tst_rksurfacelist.moc"
