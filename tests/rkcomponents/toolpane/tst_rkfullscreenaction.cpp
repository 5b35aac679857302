#include "actions/rkactionmgr.h"
#include "plugin/rkpluginmgr.h"
#include "rkcomponentsplugin.h"
#include "rkfullscreenaction.h"
#include "rktestmain.h"
#include "viewport/rkviewport.h"

#include <QDockWidget>
#include <QMenuBar>
#include <QScreen>
#include <QToolBar>

class TestRkFullScreenAction : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void withoutMainWindowNothingHappens();
    void fillsTheScreenAndEscapeReturns();
};

void TestRkFullScreenAction::initTestCase()
{
    QVERIFY(rkApp->getPluginMgr()->addPlugin(rkComponentsPlugin()));
}

void TestRkFullScreenAction::withoutMainWindowNothingHappens()
{
    QVERIFY(!rkApp->getInterface());
    RkFullScreenAction action;
    action.trigger();
    action.trigger();
    QVERIFY(!rkApp->getInterface());
}

void TestRkFullScreenAction::fillsTheScreenAndEscapeReturns()
{
    auto window = rkMakeTestMainWindow();
    window->getActionMgr()->buildMenus();
    window->show();
    window->activateWindow();
    QVERIFY(QTest::qWaitForWindowActive(window.get()));
    const QSize before = window->getMainViewport()->size();

    // The user picks View > Go Full Screen.
    QMenu* view = window->getActionMgr()->findMenu(QStringLiteral("View"), false);
    QVERIFY(view);
    QAction* goFull = nullptr;
    for (QAction* a : view->actions()) {
        if (a->text() == QLatin1String("Go Full Screen"))
            goFull = a;
    }
    QVERIFY(goFull);
    goFull->trigger();
    QVERIFY(window->isFullScreenMode());
    const QRect screen = window->screen()->geometry();
    QTRY_COMPARE(window->getMainViewport()->size(), screen.size());
    QVERIFY(!window->menuBar()->isVisible());
    const auto bars = window->findChildren<QToolBar*>();
    for (QToolBar* bar : bars)
        QVERIFY(!bar->isVisible());

    // Triggering it again changes nothing.
    goFull->trigger();
    QVERIFY(window->isFullScreenMode());

    // Esc brings the window back as it was.
    QTest::keyClick(window.get(), Qt::Key_Escape);
    QVERIFY(!window->isFullScreenMode());
    QTRY_VERIFY(window->menuBar()->isVisible());
    QTRY_COMPARE(window->getMainViewport()->size(), before);
}

RK_TEST_MAIN(TestRkFullScreenAction)
#include "tst_rkfullscreenaction.moc"
