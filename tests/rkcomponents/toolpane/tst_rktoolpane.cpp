#include "actions/rkaction.h"
#include "actions/rkactionmenu.h"
#include "actions/rkactionmgr.h"
#include "panes/rkpanemgr.h"
#include "plugin/rkpluginmgr.h"
#include "rkcomponentsplugin.h"
#include "rktestmain.h"
#include "rktoolpane.h"
#include "rktoolpaneaction.h"
#include "viewport/rkviewportmgr.h"
#include "viewport/rkviewtool.h"

#include <QDockWidget>
#include <QLabel>
#include <QMenu>
#include <QPointer>
#include <QStackedWidget>
#include <QToolBar>

namespace
{

class FirstOption : public RkAction
{
    Q_OBJECT
public:
    FirstOption() : RkAction(QStringLiteral("First Option"), QString()) {}
};

class SecondOption : public RkAction
{
    Q_OBJECT
public:
    SecondOption() : RkAction(QStringLiteral("Second Option"), QString()) {}
};

// A tool with or without an options widget and an options menu; counts how often it is asked.
class TestTool : public RkViewTool
{
    Q_OBJECT
public:
    TestTool(const QString& name, bool withWidget, const QStringList& menuEntries = {})
        : RkViewTool(name), m_withWidget(withWidget)
    {
        if (!menuEntries.isEmpty())
            setMenu(menuEntries);
    }

    QWidget* getOptionsWidget(QWidget* parent) override
    {
        ++widgetRequests;
        if (m_withWidget && !widget)
            widget = new QLabel(objectName() + QStringLiteral(" options"), parent);
        return m_withWidget ? widget.data() : nullptr;
    }

    void setMenu(const QStringList& entries)
    {
        auto* menu = new RkActionMenu;
        for (const QString& entry : entries) {
            if (entry == QLatin1String("-"))
                menu->insertSeparator();
            else
                menu->insertAction(entry);
        }
        setOptionsMenu(menu);
    }

    int widgetRequests = 0;
    QPointer<QWidget> widget;

private:
    bool m_withWidget;
};

QStringList menuTexts(RkPane* pane)
{
    QMenu menu;
    pane->fillOptionsMenu(&menu);
    QStringList texts;
    for (QAction* action : menu.actions())
        texts.append(action->isSeparator() ? QStringLiteral("-") : action->text());
    return texts;
}

} // namespace

class TestRkToolPane : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void init();
    void cleanup();
    void layoutAndFirstTool();
    void refreshWithoutSwitchChangesNothing();
    void widgetsAreReusedAcrossSwitches();
    void toolWithoutWidgetHidesTheStack();
    void optionsMenu_data();
    void optionsMenu();
    void closeEntryClosesThePane();
    void onlyTheCurrentToolRebuildsTheMenu();
    void noActiveTool();
    void toolBarDrivesThePane();

private:
    RkToolPane* pane() const;
    QLabel* nameLabel() const;
    QStackedWidget* stack() const;

    std::unique_ptr<RkMainWindow> m_window;
    RkViewportMgr* m_tools = nullptr;
    TestTool* m_a = nullptr;
    TestTool* m_b = nullptr;
    TestTool* m_bare = nullptr;
};

void TestRkToolPane::initTestCase()
{
    QVERIFY(rkApp->getPluginMgr()->addPlugin(rkComponentsPlugin()));
}

void TestRkToolPane::init()
{
    m_window = rkMakeTestMainWindow();
    m_window->getActionMgr()->addAction(new FirstOption);
    m_window->getActionMgr()->addAction(new SecondOption);
    m_tools = m_window->getViewportMgr();
    m_a = new TestTool(QStringLiteral("Tool A"), true, {QStringLiteral("FirstOption")});
    m_b = new TestTool(QStringLiteral("Tool B"), true);
    m_bare = new TestTool(QStringLiteral("Bare Tool"), false);
    m_tools->addTool(m_a);
    m_tools->addTool(m_b);
    m_tools->addTool(m_bare);
    QVERIFY(m_window->getPaneMgr()->createPane(QStringLiteral("RkToolPane")));
}

void TestRkToolPane::cleanup()
{
    m_window.reset();
}

RkToolPane* TestRkToolPane::pane() const
{
    return qobject_cast<RkToolPane*>(
        m_window->getPaneMgr()->findPane(QStringLiteral("RkToolPane")));
}

QLabel* TestRkToolPane::nameLabel() const
{
    return pane()->findChild<QLabel*>(QStringLiteral("Tool Pane Name"));
}

QStackedWidget* TestRkToolPane::stack() const
{
    return pane()->findChild<QStackedWidget*>(QStringLiteral("Tool Pane Widget Stack"));
}

void TestRkToolPane::layoutAndFirstTool()
{
    m_window->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_window.get()));
    // The first refresh happens when the pane is shown and shows the active tool.
    QCOMPARE(nameLabel()->text(), QStringLiteral("Tool A"));
    QVERIFY(stack()->isVisible());
    QCOMPARE(stack()->currentWidget(), m_a->widget.data());
    // Name at the top, the options widget below it.
    QVERIFY(nameLabel()->geometry().bottom() <= stack()->geometry().top());
}

void TestRkToolPane::refreshWithoutSwitchChangesNothing()
{
    pane()->refresh();
    const int requests = m_a->widgetRequests;
    RkActionMenu* menu = pane()->getOptionsMenu();
    QVERIFY(menu);
    pane()->refresh();
    pane()->refresh();
    QCOMPARE(m_a->widgetRequests, requests);
    QCOMPARE(pane()->getOptionsMenu(), menu);
    QCOMPARE(stack()->count(), 1);
}

void TestRkToolPane::widgetsAreReusedAcrossSwitches()
{
    pane()->refresh();
    m_tools->setActiveTool(m_b);
    QCOMPARE(nameLabel()->text(), QStringLiteral("Tool B"));
    QCOMPARE(stack()->currentWidget(), m_b->widget.data());
    m_tools->setActiveTool(m_a);
    QCOMPARE(nameLabel()->text(), QStringLiteral("Tool A"));
    QCOMPARE(stack()->count(), 2);
    QCOMPARE(stack()->currentWidget(), m_a->widget.data());
    QCOMPARE(m_a->widget->parentWidget(), static_cast<QWidget*>(stack()));
}

void TestRkToolPane::toolWithoutWidgetHidesTheStack()
{
    m_window->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_window.get()));
    m_tools->setActiveTool(m_bare);
    QVERIFY(!stack()->isVisible());
    QVERIFY(nameLabel()->isVisible());
    QCOMPARE(nameLabel()->text(), QStringLiteral("Bare Tool"));
    // Back to a tool with a widget: the stack comes back.
    m_tools->setActiveTool(m_b);
    QVERIFY(stack()->isVisible());
}

void TestRkToolPane::optionsMenu_data()
{
    QTest::addColumn<QStringList>("toolMenu");
    QTest::addColumn<QStringList>("shown");
    QTest::newRow("no menu") << QStringList() << QStringList({"Close"});
    QTest::newRow("one entry") << QStringList({"FirstOption"})
                               << QStringList({"First Option", "-", "Close"});
    QTest::newRow("separated entries")
        << QStringList({"FirstOption", "-", "SecondOption"})
        << QStringList({"First Option", "-", "Second Option", "-", "Close"});
    // An entry naming no known action is left out rather than shown blank.
    QTest::newRow("unknown action") << QStringList({"NoSuchAction"}) << QStringList({"Close"});
}

void TestRkToolPane::optionsMenu()
{
    QFETCH(QStringList, toolMenu);
    QFETCH(QStringList, shown);
    m_bare->setMenu(toolMenu);
    m_tools->setActiveTool(m_bare);
    QCOMPARE(menuTexts(pane()), shown);
}

void TestRkToolPane::closeEntryClosesThePane()
{
    m_window->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_window.get()));
    QDockWidget* dock = m_window->getPaneMgr()->getDockWidget(pane());
    QVERIFY(dock->isVisible());
    QMenu menu;
    pane()->fillOptionsMenu(&menu);
    QAction* close = menu.actions().constLast();
    QCOMPARE(close->text(), QStringLiteral("Close"));
    QVERIFY(close->shortcut().isEmpty());
    close->trigger();
    QVERIFY(!dock->isVisible());
    // The pane action sees the pane go.
    auto* action = m_window->getActionMgr()->findAction(QStringLiteral("RkToolPaneAction"));
    QVERIFY(action);
    QVERIFY(!action->isChecked());
    action->trigger();
    QVERIFY(dock->isVisible());
    QVERIFY(action->isChecked());
}

void TestRkToolPane::onlyTheCurrentToolRebuildsTheMenu()
{
    pane()->refresh();
    m_tools->setActiveTool(m_b);
    QCOMPARE(menuTexts(pane()), QStringList({"Close"}));
    // The former tool changes its menu: the pane keeps showing B's.
    m_a->setMenu({QStringLiteral("SecondOption")});
    QCOMPARE(menuTexts(pane()), QStringList({"Close"}));
    // The current tool changes its menu: the pane follows without a switch.
    const int requests = m_b->widgetRequests;
    m_b->setMenu({QStringLiteral("SecondOption")});
    QCOMPARE(menuTexts(pane()), QStringList({"Second Option", "-", "Close"}));
    QCOMPARE(m_b->widgetRequests, requests);
}

void TestRkToolPane::noActiveTool()
{
    // A main window whose viewport manager has no tool at all.
    m_window = rkMakeTestMainWindow();
    RkPane* p = m_window->getPaneMgr()->createPane(QStringLiteral("RkToolPane"));
    QVERIFY(p);
    m_window->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_window.get()));
    QVERIFY(nameLabel()->text().isEmpty());
    QVERIFY(!stack()->isVisible());
    QCOMPARE(menuTexts(p), QStringList({"Close"}));

    // A pane made without any main window does not crash either.
    m_window.reset();
    RkToolPane orphan;
    orphan.refresh();
    QMenu menu;
    orphan.fillOptionsMenu(&menu);
    QCOMPARE(menu.actions().size(), 1);
}

void TestRkToolPane::toolBarDrivesThePane()
{
    m_window->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_window.get()));
    QSignalSpy switched(m_tools, &RkViewportMgr::activeToolSwitched);
    auto* toolBar = m_window->findChild<QToolBar*>(QStringLiteral("ViewportToolBar"));
    QVERIFY(toolBar);
    auto* button = toolBar->findChild<QWidget*>(QStringLiteral("Tool B"));
    QVERIFY(button);
    QTest::mouseClick(button, Qt::LeftButton);
    QCOMPARE(switched.count(), 1);
    QCOMPARE(m_tools->getActiveTool(), static_cast<RkViewTool*>(m_b));
    QCOMPARE(nameLabel()->text(), QStringLiteral("Tool B"));
    // Clicking the active tool again is no switch.
    QTest::mouseClick(button, Qt::LeftButton);
    QCOMPARE(switched.count(), 1);
}

RK_TEST_MAIN(TestRkToolPane)
#include "tst_rktoolpane.moc"
