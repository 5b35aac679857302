#include "actions/rkaction.h"
#include "actions/rkactionmenu.h"
#include "actions/rkactionmgr.h"
#include "panes/rkpane.h"
#include "panes/rkpaneaction.h"
#include "panes/rkpanemgr.h"
#include "panes/rkpanesettings.h"
#include "plugin/rkclassfactory.h"
#include "plugin/rkplugin.h"
#include "plugin/rkpluginmgr.h"
#include "rktestfactory.h"
#include "rktestmain.h"

#include <QDockWidget>
#include <QMenu>
#include <QSettings>
#include <QTabBar>
#include <QTemporaryDir>
#include <QTimer>
#include <QToolButton>

namespace
{

class ListPaneOption : public RkAction
{
    Q_OBJECT
public:
    ListPaneOption() : RkAction(QStringLiteral("Compact Rows"), QString()) {}
};

// A pane with one stored switch and an options menu that depends on it.
class ListPane : public RkPane
{
    Q_OBJECT
public:
    ListPane() : RkPane(QStringLiteral("List")) {}
    void restoreSettings(const RkPaneSettings& settings) override
    {
        compact = settings.getBoolValue(QStringLiteral("Compact"), false);
    }
    void saveSettings(RkPaneSettings& settings) const override
    {
        settings.setBoolValue(QStringLiteral("Compact"), compact);
    }
    void buildOptionsMenu(RkActionMenu* menu) const override
    {
        ++builds;
        menu->insertAction(QStringLiteral("ListPaneOption"));
        if (compact)
            menu->insertAction(QStringLiteral("ListPaneOption"));
    }
    int getOptionsMenuVersion() const override { return compact ? 2 : 1; }
    void refresh() override { ++refreshes; }

    bool compact = false;
    mutable int builds = 0;
    int refreshes = 0;
};

class OtherPane : public RkPane
{
    Q_OBJECT
public:
    OtherPane() : RkPane(QStringLiteral("Other")) {}
};

class ListPaneAction : public RkPaneAction
{
    Q_OBJECT
public:
    ListPaneAction() : RkPaneAction(QStringLiteral("ListPane")) {}
};

RkTestFactory<ListPane> listFactory("b0000000-0000-0000-0000-000000000001");
RkTestFactory<OtherPane> otherFactory("b0000000-0000-0000-0000-000000000002");
RkTestFactory<ListPaneAction> actionFactory("b0000000-0000-0000-0000-000000000003");
RkTestFactory<ListPaneOption> optionFactory("b0000000-0000-0000-0000-000000000004");
RkPlugin plugin(QStringLiteral("Panes"), QString(), QString(), 0);

// Clicks the dock's options button and reads the menu that pops up.
QStringList optionsShown(QDockWidget* dock)
{
    auto* button = dock->findChild<QToolButton*>(QStringLiteral("PaneOptionsButton"));
    if (!button)
        return {QStringLiteral("<no button>")};
    QStringList shown;
    QTimer reader;
    reader.setSingleShot(true);
    QObject::connect(&reader, &QTimer::timeout, [&shown] {
        auto* menu = qobject_cast<QMenu*>(QApplication::activePopupWidget());
        if (!menu)
            return;
        for (QAction* a : menu->actions())
            shown.append(a->isSeparator() ? QStringLiteral("-") : a->text());
        menu->close();
    });
    reader.start(0);
    // What a click on the button does; the menu runs its own event loop until it closes.
    button->showMenu();
    reader.stop();
    return shown;
}

} // namespace

class TestRkPaneMgr : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void createAndDockTabbed();
    void optionsButtonShowsThePaneMenu();
    void paneActionFollowsVisibility();
    void settingsLastBetweenRuns();
    void settingsValues();
};

void TestRkPaneMgr::initTestCase()
{
    plugin.addClassFactory(&listFactory);
    plugin.addClassFactory(&otherFactory);
    plugin.addClassFactory(&actionFactory);
    plugin.addClassFactory(&optionFactory);
    QVERIFY(rkApp->getPluginMgr()->addPlugin(&plugin));
}

void TestRkPaneMgr::createAndDockTabbed()
{
    auto window = rkMakeTestMainWindow();
    RkPaneMgr* mgr = window->getPaneMgr();
    QCOMPARE(mgr->findPane(QStringLiteral("ListPane")), static_cast<RkPane*>(nullptr));
    const int logLines = rkApp->getLog().size();
    QCOMPARE(mgr->createPane(QStringLiteral("ListPaneAction")), static_cast<RkPane*>(nullptr));
    QCOMPARE(rkApp->getLog().size(), logLines + 1);

    mgr->createPanes();
    QCOMPARE(mgr->getPanes().size(), 2);
    auto* list = qobject_cast<ListPane*>(mgr->findPane(QStringLiteral("ListPane")));
    QVERIFY(list);
    QCOMPARE(mgr->createPane(QStringLiteral("ListPane")), list);
    window->show();
    QVERIFY(QTest::qWaitForWindowExposed(window.get()));
    QVERIFY(list->refreshes >= 1);

    // Both docks on the right, tabbed, labelled by the panes' tab labels.
    QDockWidget* listDock = mgr->getDockWidget(list);
    QDockWidget* otherDock = mgr->getDockWidget(mgr->findPane(QStringLiteral("OtherPane")));
    QCOMPARE(window->dockWidgetArea(listDock), Qt::RightDockWidgetArea);
    QCOMPARE(window->tabifiedDockWidgets(listDock), QList<QDockWidget*>({otherDock}));
    QStringList tabs;
    for (QTabBar* bar : window->findChildren<QTabBar*>()) {
        for (int i = 0; i < bar->count(); ++i)
            tabs.append(bar->tabText(i));
    }
    tabs.sort();
    QCOMPARE(tabs, QStringList({"List", "Other"}));
}

void TestRkPaneMgr::optionsButtonShowsThePaneMenu()
{
    QTemporaryDir dir;
    auto window = rkMakeTestMainWindow();
    RkPaneMgr* mgr = window->getPaneMgr();
    mgr->setSettingsFile(dir.filePath(QStringLiteral("panes.ini")));
    auto* list = qobject_cast<ListPane*>(mgr->createPane(QStringLiteral("ListPane")));
    QVERIFY(!list->compact);
    auto* other = mgr->createPane(QStringLiteral("OtherPane"));
    window->show();
    QVERIFY(QTest::qWaitForWindowExposed(window.get()));
    QCOMPARE(optionsShown(mgr->getDockWidget(list)), QStringList({"Compact Rows"}));
    QCOMPARE(optionsShown(mgr->getDockWidget(list)), QStringList({"Compact Rows"}));
    QCOMPARE(list->builds, 1); // same version: built once
    list->compact = true;
    QCOMPARE(optionsShown(mgr->getDockWidget(list)).size(), 1); // one action, listed once
    QCOMPARE(list->builds, 2);
    QCOMPARE(optionsShown(mgr->getDockWidget(other)), QStringList({"(no options)"}));

    // An installed menu wins over the built one.
    auto* installed = new RkActionMenu;
    installed->insertAction(QStringLiteral("ListPaneOption"));
    installed->insertSeparator();
    installed->insertAction(QStringLiteral("ListPaneOption"));
    list->setOptionsMenu(installed);
    QCOMPARE(list->getOptionsMenu(), installed);
}

void TestRkPaneMgr::paneActionFollowsVisibility()
{
    auto window = rkMakeTestMainWindow();
    window->getPaneMgr()->createPanes();
    window->getActionMgr()->buildMenus();
    window->show();
    QVERIFY(QTest::qWaitForWindowExposed(window.get()));
    RkAction* action = window->getActionMgr()->findAction(QStringLiteral("ListPaneAction"));
    QVERIFY(action);
    QCOMPARE(action->text(), QStringLiteral("List"));
    QVERIFY(action->isCheckable());
    QVERIFY(action->isChecked());
    QCOMPARE(window->getActionMgr()->findMenu(QStringLiteral("Window/Panes"), false)->actions(),
             QList<QAction*>({action}));

    RkPane* pane = window->getPaneMgr()->findPane(QStringLiteral("ListPane"));
    QDockWidget* dock = window->getPaneMgr()->getDockWidget(pane);
    // Closed from its dock button: the check mark goes.
    QTest::mouseClick(dock->findChild<QToolButton*>(QStringLiteral("PaneCloseButton")),
                      Qt::LeftButton);
    QVERIFY(!dock->isVisible());
    QVERIFY(!action->isChecked());
    // Shown from the menu: the dock comes back.
    action->trigger();
    QVERIFY(dock->isVisible());
    QVERIFY(action->isChecked());
    pane->hidePane();
    QVERIFY(!action->isChecked());
}

void TestRkPaneMgr::settingsLastBetweenRuns()
{
    QTemporaryDir dir;
    const QString file = dir.filePath(QStringLiteral("panes.ini"));
    {
        auto window = rkMakeTestMainWindow();
        window->getPaneMgr()->setSettingsFile(file);
        auto* list =
            qobject_cast<ListPane*>(window->getPaneMgr()->createPane(QStringLiteral("ListPane")));
        QVERIFY(!list->compact);
        list->compact = true;
    } // the window goes: settings are written
    QSettings stored(file, QSettings::IniFormat);
    QCOMPARE(stored.value(QStringLiteral("Panes/ListPane/Compact")).toString(),
             QStringLiteral("true"));
    {
        auto window = rkMakeTestMainWindow();
        window->getPaneMgr()->setSettingsFile(file);
        auto* list =
            qobject_cast<ListPane*>(window->getPaneMgr()->createPane(QStringLiteral("ListPane")));
        QVERIFY(list->compact);
    }

    // The default store lives under the test's private configuration folder, never the user's.
    QSettings(QSettings::IniFormat, QSettings::UserScope, QStringLiteral("rkhost"),
              QStringLiteral("panes"))
        .clear();
    {
        auto window = rkMakeTestMainWindow();
        window->getPaneMgr()->createPane(QStringLiteral("ListPane"));
    }
    QSettings defaultStore(QSettings::IniFormat, QSettings::UserScope, QStringLiteral("rkhost"),
                           QStringLiteral("panes"));
    const QString home = qEnvironmentVariable("HOME");
    QVERIFY2(home.endsWith(QLatin1String("/tst_rkpanemgr")), qPrintable(home));
    QVERIFY2(defaultStore.fileName().startsWith(home), qPrintable(defaultStore.fileName()));
    QVERIFY(defaultStore.contains(QStringLiteral("Panes/ListPane/Compact")));
}

void TestRkPaneMgr::settingsValues()
{
    RkPaneSettings settings(QStringLiteral("ListPane"));
    settings.setBoolValue(QStringLiteral("On"), true);
    settings.setIntValue(QStringLiteral("Height"), 120);
    settings.setStringValue(QStringLiteral("Odd"), QStringLiteral("maybe"));
    // Text that is no boolean gives the default instead of a guess.
    QCOMPARE(settings.getBoolValue(QStringLiteral("Odd"), true), true);
    QCOMPARE(settings.getBoolValue(QStringLiteral("Odd"), false), false);

    // Read back from a file, values arrive as text and still convert.
    QTemporaryDir dir;
    QSettings store(dir.filePath(QStringLiteral("s.ini")), QSettings::IniFormat);
    settings.store(store);
    store.sync();
    QSettings reread(dir.filePath(QStringLiteral("s.ini")), QSettings::IniFormat);
    RkPaneSettings loaded(QStringLiteral("ListPane"));
    loaded.load(reread);
    QCOMPARE(loaded.getBoolValue(QStringLiteral("On")), true);
    QCOMPARE(loaded.getIntValue(QStringLiteral("Height")), 120);
    QCOMPARE(loaded.keys().size(), 3);
}

RK_TEST_MAIN(TestRkPaneMgr)
#include "tst_rkpanemgr.moc"
