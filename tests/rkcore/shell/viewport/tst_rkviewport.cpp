#include "rktestmain.h"
#include "viewport/rkview.h"
#include "viewport/rkviewport.h"
#include "viewport/rkviewportmgr.h"
#include "viewport/rkviewtool.h"
#include "viewport/rkviewtoolbar.h"

#include <QLabel>
#include <QPointer>
#include <QToolBar>

class TestRkViewport : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void viewTakesThePlaceOfThePicture();
    void toolsAndSwitching();
};

void TestRkViewport::viewTakesThePlaceOfThePicture()
{
    auto window = rkMakeTestMainWindow();
    window->show();
    QVERIFY(QTest::qWaitForWindowExposed(window.get()));
    RkViewport* viewport = window->getViewportMgr()->getActiveViewport();
    QCOMPARE(viewport, window->getMainViewport());
    QCOMPARE(window->centralWidget(), static_cast<QWidget*>(viewport));

    auto* picture = new QLabel(QStringLiteral("scene"));
    window->setSceneWidget(picture);
    QVERIFY(picture->isVisible());
    QCOMPARE(picture->size(), viewport->size());

    QPointer<RkView> view = new RkView(QStringLiteral("TestView"));
    QLabel* onBar = new QLabel(QStringLiteral("mode"));
    view->getToolBar()->addWidget(onBar, RkViewToolBar::Right);
    QSignalSpy changed(viewport, &RkViewport::viewChanged);
    viewport->setView(view);
    QVERIFY(view->isVisible());
    QVERIFY(!picture->isVisible());
    QCOMPARE(view->size(), viewport->size());
    QCOMPARE(onBar->parentWidget(), static_cast<QWidget*>(view->getToolBar()));

    // Back to the picture: the view is deleted once control returns to the event loop.
    viewport->setView(nullptr);
    QVERIFY(picture->isVisible());
    QCOMPARE(viewport->getView(), static_cast<RkView*>(nullptr));
    QTRY_VERIFY(!view);
    QCOMPARE(changed.count(), 2);

    // A new picture replaces (and deletes) the old one.
    QPointer<QLabel> old = picture;
    window->setSceneWidget(new QLabel(QStringLiteral("other")));
    QVERIFY(!old);
}

void TestRkViewport::toolsAndSwitching()
{
    RkViewportMgr mgr;
    QSignalSpy switched(&mgr, &RkViewportMgr::activeToolSwitched);
    QCOMPARE(mgr.getActiveTool(), static_cast<RkViewTool*>(nullptr));
    auto* first = new RkViewTool(QStringLiteral("First"));
    auto* second = new RkViewTool(QStringLiteral("Second"));
    mgr.addTool(first);
    QCOMPARE(mgr.getActiveTool(), first); // the first tool becomes active
    mgr.addTool(second);
    QCOMPARE(switched.count(), 1);
    mgr.setActiveTool(first);
    QCOMPARE(switched.count(), 1);
    RkViewTool stranger(QStringLiteral("Stranger"));
    mgr.setActiveTool(&stranger);
    QCOMPARE(mgr.getActiveTool(), first);
    QCOMPARE(mgr.findTool(QStringLiteral("Second")), second);

    // One checkable button per tool, named after it; the bar shows the active one checked.
    std::unique_ptr<QToolBar> bar(mgr.getToolBar());
    bar->show();
    QVERIFY(QTest::qWaitForWindowExposed(bar.get()));
    auto* secondButton = bar->findChild<QWidget*>(QStringLiteral("Second"));
    QVERIFY(secondButton);
    QTest::mouseClick(secondButton, Qt::LeftButton);
    QCOMPARE(mgr.getActiveTool(), second);
    QCOMPARE(switched.count(), 2);
    mgr.setActiveTool(first);
    for (QAction* action : bar->actions())
        QCOMPARE(action->isChecked(), action->objectName() == QLatin1String("First"));

    // A tool that goes away leaves no button behind that could reach it.
    delete second;
    QCOMPARE(mgr.getTools().size(), 1);
    QCOMPARE(bar->actions().size(), 1);
    QTRY_VERIFY(!bar->findChild<QWidget*>(QStringLiteral("Second")));
}

RK_TEST_MAIN(TestRkViewport)
#include "tst_rkviewport.moc"
