#include "app/rkmainwindow.h"
#include "demo/rkdemoscene.h"
#include "properties/rkfloatproperty.h"
#include "rkpropertiesdock.h"
#include "rktestmain.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "widgets/rkpropertywgt.h"

class TestRkPropertiesDock : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void showsThePrimarySelection();
    void deletedNodeLeavesAnEmptyDock();

private:
    static QList<RkPropertyWgt*> widgets(RkPropertiesDock& dock)
    {
        return dock.findChildren<RkPropertyWgt*>();
    }
};

void TestRkPropertiesDock::showsThePrimarySelection()
{
    auto window = rkMakeTestMainWindow();
    RkSkeleton* figure = rkBuildDemoScene(rkScene);
    RkPropertiesDock* dock = rkAddPropertiesDock(window.get());
    QVERIFY(widgets(*dock).isEmpty());

    rkScene->selectNode(figure, false);
    QTRY_VERIFY(dock->shownNode() == figure);
    int visible = 0;
    for (RkProperty* p : figure->getProperties())
        visible += p->isHidden() ? 0 : 1;
    QCOMPARE(widgets(*dock).size(), visible);
    // Every widget edits one of the figure's properties; hidden ones are left out.
    for (RkPropertyWgt* w : widgets(*dock)) {
        QVERIFY(figure->getProperties().contains(w->getFirstProperty()));
        QVERIFY(!w->getFirstProperty()->isHidden());
    }

    RkNode* ball = rkScene->findNode(RkDemoPropName);
    rkScene->selectNode(ball, false);
    QTRY_VERIFY(dock->shownNode() == ball);
    QTRY_COMPARE(widgets(*dock).size(), ball->getNumProperties());
    rkScene->clear();
}

void TestRkPropertiesDock::deletedNodeLeavesAnEmptyDock()
{
    auto window = rkMakeTestMainWindow();
    RkSkeleton* figure = rkBuildDemoScene(rkScene);
    RkPropertiesDock* dock = rkAddPropertiesDock(window.get());
    rkScene->selectNode(figure, false);
    QTRY_VERIFY(!widgets(*dock).isEmpty());
    rkScene->removeNode(figure);
    QTRY_VERIFY(widgets(*dock).isEmpty());
    QVERIFY(!dock->shownNode());
    rkScene->clear();
}

RK_TEST_MAIN(TestRkPropertiesDock)
#include "tst_rkpropertiesdock.moc"
