#include "actions/rkaction.h"
#include "actions/rkactionmenu.h"
#include "actions/rkactionmgr.h"
#include "actions/rkhelpmgr.h"
#include "plugin/rkclassfactory.h"
#include "plugin/rkplugin.h"
#include "plugin/rkpluginmgr.h"
#include "rktestfactory.h"
#include "rktestmain.h"

#include <QMenu>
#include <QMenuBar>
#include <QToolBar>

namespace
{

class CountingAction : public RkAction
{
    Q_OBJECT
public:
    CountingAction() : RkAction(QStringLiteral("&Count"), QStringLiteral("Counts triggers")) {}
    QString getDefaultMenuPath() const override { return QStringLiteral("&Tools/&Counting"); }
    QString getDefaultToolBar() const override { return QStringLiteral("CountingBar"); }
    QKeySequence getDefaultAccel() const override { return QKeySequence(QStringLiteral("Ctrl+K")); }
    void init() override { ++inits; }
    void executeAction() override { ++executed; }
    void toggleAction(bool on) override { toggles.append(on); }
    int inits = 0;
    int executed = 0;
    QList<bool> toggles;
};

class AlphaAction : public RkAction
{
    Q_OBJECT
public:
    AlphaAction() : RkAction(QStringLiteral("Zeta"), QString()) {}
    QString getActionGroup() const override { return QStringLiteral("A"); }
    QString getDefaultMenuPath() const override { return QStringLiteral("Tools"); }
};

class BetaAction : public RkAction
{
    Q_OBJECT
public:
    BetaAction() : RkAction(QStringLiteral("Alpha"), QString()) {}
    QString getActionGroup() const override { return QStringLiteral("B"); }
    QString getDefaultMenuPath() const override { return QStringLiteral("&Tools"); }
};

// A registered class that is no action.
class NotAnAction : public QObject
{
    Q_OBJECT
};

RkTestFactory<CountingAction> countingFactory("a0000000-0000-0000-0000-000000000001");
RkTestFactory<AlphaAction> alphaFactory("a0000000-0000-0000-0000-000000000002");
RkTestFactory<BetaAction> betaFactory("a0000000-0000-0000-0000-000000000003");
RkTestFactory<NotAnAction> notActionFactory("a0000000-0000-0000-0000-000000000004");
RkPlugin plugin(QStringLiteral("Actions"), QString(), QString(), 0);

QStringList texts(const QMenu* menu)
{
    QStringList result;
    for (QAction* a : menu->actions()) {
        if (a->isSeparator())
            result.append(QStringLiteral("-"));
        else if (a->menu())
            result.append(a->text() + QStringLiteral(" >"));
        else
            result.append(a->text());
    }
    return result;
}

} // namespace

class TestRkActionMgr : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void init();
    void cleanup();
    void copiesAreDeep();
    void buildMenu();
    void findActionCreatesOnceAndLogsUnknownOnce();
    void triggerRunsTheAction();
    void mainMenusFromDefaultPaths();
    void onlineHelp();

private:
    std::unique_ptr<RkMainWindow> m_window;
};

void TestRkActionMgr::initTestCase()
{
    plugin.addClassFactory(&countingFactory);
    plugin.addClassFactory(&alphaFactory);
    plugin.addClassFactory(&betaFactory);
    plugin.addClassFactory(&notActionFactory);
    QVERIFY(rkApp->getPluginMgr()->addPlugin(&plugin));
}

void TestRkActionMgr::init()
{
    m_window = rkMakeTestMainWindow();
}

void TestRkActionMgr::cleanup()
{
    m_window.reset();
}

void TestRkActionMgr::copiesAreDeep()
{
    RkActionMenu original;
    auto* sub = new RkActionMenu;
    sub->insertAction(QStringLiteral("Inner"));
    original.insertMenu(QStringLiteral("Sub"), sub);
    RkActionMenu copy(original);
    // Changing the original's sub-menu leaves the copy alone, and the copy outlives it.
    sub->insertAction(QStringLiteral("Later"));
    QCOMPARE(copy.subMenu(0)->count(), 1);
    RkActionMenu assigned;
    assigned = copy;
    copy.clear();
    QCOMPARE(assigned.subMenu(0)->entryText(0), QStringLiteral("Inner"));
}

void TestRkActionMgr::buildMenu()
{
    RkActionMenu menu;
    menu.insertSeparator(); // leading: dropped
    menu.insertAction(QStringLiteral("CountingAction"));
    menu.insertSeparator();
    menu.insertSeparator();                            // doubled: one
    menu.insertAction(QStringLiteral("NoSuchAction")); // unknown: skipped
    auto* sub = new RkActionMenu;
    sub->insertAction(QStringLiteral("AlphaAction"));
    menu.insertMenu(QStringLiteral("More"), sub);
    menu.insertSeparator(); // trailing: dropped
    QMenu built;
    menu.buildMenu(&built);
    QCOMPARE(texts(&built), QStringList({"&Count", "-", "More >"}));
    QCOMPARE(texts(built.actions().at(2)->menu()), QStringList({"Zeta"}));

    // Without a main window there is no action to show, and nothing breaks.
    m_window.reset();
    QMenu empty;
    menu.buildMenu(&empty);
    QCOMPARE(texts(&empty), QStringList({"More >"}));
}

void TestRkActionMgr::findActionCreatesOnceAndLogsUnknownOnce()
{
    RkActionMgr* mgr = m_window->getActionMgr();
    auto* action = qobject_cast<CountingAction*>(mgr->findAction(QStringLiteral("CountingAction")));
    QVERIFY(action);
    QCOMPARE(action->inits, 1);
    QCOMPARE(mgr->findAction(QStringLiteral("CountingAction")), action);
    QCOMPARE(action->inits, 1);
    QCOMPARE(action->parent(), static_cast<QObject*>(m_window.get()));
    QCOMPARE(action->shortcut(), QKeySequence(QStringLiteral("Ctrl+K")));

    const int logLines = rkApp->getLog().size();
    QCOMPARE(mgr->findAction(QStringLiteral("NoSuchAction")), static_cast<RkAction*>(nullptr));
    QCOMPARE(mgr->findAction(QStringLiteral("NoSuchAction")), static_cast<RkAction*>(nullptr));
    QCOMPARE(mgr->findAction(QStringLiteral("NotAnAction")), static_cast<RkAction*>(nullptr));
    QCOMPARE(rkApp->getLog().size(), logLines + 2);

    QMenu menu;
    QVERIFY(mgr->addActionToMenu(QStringLiteral("CountingAction"), &menu));
    QVERIFY(!mgr->addActionToMenu(QStringLiteral("NoSuchAction"), &menu));
    QCOMPARE(menu.actions().size(), 1);
}

void TestRkActionMgr::triggerRunsTheAction()
{
    auto* action = qobject_cast<CountingAction*>(
        m_window->getActionMgr()->findAction(QStringLiteral("CountingAction")));
    action->trigger();
    QCOMPARE(action->executed, 1);
    action->setCheckable(true);
    action->trigger();
    action->trigger();
    QCOMPARE(action->executed, 1);
    QCOMPARE(action->toggles, QList<bool>({true, false}));
}

void TestRkActionMgr::mainMenusFromDefaultPaths()
{
    m_window->addMenu(QStringLiteral("&File"));
    RkActionMgr* mgr = m_window->getActionMgr();
    mgr->buildMenus();
    mgr->buildMenus(); // placing twice adds nothing
    QMenu* tools = mgr->findMenu(QStringLiteral("&Tools"), false);
    QVERIFY(tools);
    QCOMPARE(mgr->findMenu(QStringLiteral("Tools"), false), tools);
    // Sorted by group, then text; the nested path became a sub-menu.
    QCOMPARE(texts(tools), QStringList({"Zeta", "Alpha", "&Counting >"}));
    QCOMPARE(texts(mgr->findMenu(QStringLiteral("Tools/Counting"), false)),
             QStringList({"&Count"}));
    QCOMPARE(texts(m_window->menuBar()->actions().first()->menu()), QStringList());
    QCOMPARE(m_window->menuBar()->actions().first()->text(), QStringLiteral("&File"));
    auto* bar = m_window->findChild<QToolBar*>(QStringLiteral("CountingBar"));
    QVERIFY(bar);
    QCOMPARE(bar->actions().size(), 1);
    QCOMPARE(mgr->findMenu(QStringLiteral("Nowhere"), false), static_cast<QMenu*>(nullptr));
}

void TestRkActionMgr::onlineHelp()
{
    RkAction action(QStringLiteral("Save &As && Close"), QStringLiteral("Saves, then closes"));
    rkApp->getHelpMgr()->setOnlineHelp(&action);
    QCOMPARE(action.toolTip(), QStringLiteral("Save As & Close"));
    QCOMPARE(action.statusTip(), QStringLiteral("Saves, then closes"));
    action.setDescription(QStringLiteral("Changed"));
    QCOMPARE(action.statusTip(), QStringLiteral("Changed"));

    QWidget button;
    rkApp->getHelpMgr()->setOnlineHelp(&button, QStringLiteral("Refresh"),
                                       QStringLiteral("Refresh"), QString(), QString());
    QCOMPARE(button.toolTip(), QStringLiteral("Refresh"));
    QCOMPARE(button.statusTip(), QStringLiteral("Refresh"));
    QVERIFY(rkApp->getHelpMgr()->hasOnlineHelp(&button));
}

RK_TEST_MAIN(TestRkActionMgr)
#include "tst_rkactionmgr.moc"
