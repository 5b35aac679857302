#include "actions/rkaction.h"
#include "actions/rkactionmenu.h"
#include "actions/rkactionmgr.h"
#include "demo/rkdemoscene.h"
#include "panes/rkpanemgr.h"
#include "panes/rkpanesettings.h"
#include "plugin/rkpluginmgr.h"
#include "properties/rkproperty.h"
#include "rkcomponentsplugin.h"
#include "rkfavoritesaddaction.h"
#include "rkpropertiespane.h"
#include "rkpropertypanelist.h"
#include "rktestmain.h"
#include "scene/rkbone.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "widgets/rkpropertywgt.h"
#include "widgets/rkwidgetgroup.h"

#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QScrollBar>
#include <QSettings>
#include <QTemporaryDir>

namespace
{

// The list's widget of the property, scrolled into view; pooled widgets not in use are hidden.
RkPropertyWgt* widgetOf(RkPropertyPaneList* list, RkProperty* property)
{
    for (RkPropertyWgt* widget : list->findChildren<RkPropertyWgt*>()) {
        if (!widget->isHidden() && widget->getProperties().contains(property)) {
            list->ensureWidgetVisible(widget);
            return widget;
        }
    }
    return nullptr;
}

RkNode* ball()
{
    for (RkNode* node : rkScene->getNodes()) {
        if (node->getLabel() == QLatin1String("Ball"))
            return node;
    }
    return nullptr;
}

// Action texts of a menu, "|" for a separator.
QStringList entriesOf(QMenu* menu)
{
    QStringList entries;
    for (QAction* action : menu->actions())
        entries.append(action->isSeparator() ? QStringLiteral("|") : action->text());
    return entries;
}

// Entries of an options menu, sub-menus as "Title:" followed by their entries and "/".
QStringList entriesOf(const RkActionMenu* menu)
{
    QStringList entries;
    for (int i = 0; i < menu->count(); ++i) {
        switch (menu->entryType(i)) {
        case RkActionMenu::Separator:
            entries.append(QStringLiteral("|"));
            break;
        case RkActionMenu::Action:
            entries.append(menu->entryText(i));
            break;
        case RkActionMenu::SubMenu:
            entries.append(menu->entryText(i) + QLatin1Char(':'));
            entries += entriesOf(menu->subMenu(i));
            entries.append(QStringLiteral("/"));
            break;
        }
    }
    return entries;
}

} // namespace

class TestRkPropertiesPane : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void init();
    void cleanup();

    void followsSelectionWithOneRebuild();
    void loadRebuildsOnceAtTheEnd();
    void favoritesMenu_data();
    void favoritesMenu();
    void addingToFavoritesMovesTheProperty();
    void settingsRoundTrip();
    void optionsMenuListsHostActions();
    void favoritesActionOutlivesThePane();
    void filterListsMatchingProperties();

private:
    RkPropertiesPane* pane() const;
    QString caption() const;
    QStringList rightClickMenu(RkPropertyWgt* widget);

    std::unique_ptr<RkMainWindow> m_window;
    RkSkeleton* m_figure = nullptr;
    RkBone* m_bone = nullptr;
};

void TestRkPropertiesPane::initTestCase()
{
    QVERIFY(rkApp->getPluginMgr()->addPlugin(rkComponentsPlugin()));
}

void TestRkPropertiesPane::init()
{
    rkScene->clear();
    m_figure = rkBuildDemoScene(rkScene);
    QList<RkBone*> bones;
    m_figure->getAllBones(bones);
    m_bone = bones.at(1);
    m_window = rkMakeTestMainWindow();
    QVERIFY(m_window->getPaneMgr()->createPane(QStringLiteral("RkPropertiesPane")));
    // The pane manager restored what earlier windows stored: back to the defaults.
    pane()->restoreSettings(RkPaneSettings(QStringLiteral("RkPropertiesPane")));
    m_window->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_window.get()));
    QCoreApplication::processEvents();
}

void TestRkPropertiesPane::cleanup()
{
    m_window.reset();
    rkScene->clear();
}

RkPropertiesPane* TestRkPropertiesPane::pane() const
{
    return qobject_cast<RkPropertiesPane*>(
        m_window->getPaneMgr()->findPane(QStringLiteral("RkPropertiesPane")));
}

QString TestRkPropertiesPane::caption() const
{
    return pane()->findChildren<QLabel*>().at(1)->text();
}

// Right-presses the widget and returns the entries of the menu it opens (empty: no menu).
QStringList TestRkPropertiesPane::rightClickMenu(RkPropertyWgt* widget)
{
    QStringList entries;
    QTimer::singleShot(50, this, [&entries] {
        if (auto* menu = qobject_cast<QMenu*>(QApplication::activePopupWidget())) {
            entries = entriesOf(menu);
            menu->close();
        }
    });
    QTest::mousePress(widget, Qt::RightButton, {}, QPoint(10, 5));
    QTest::mouseRelease(widget, Qt::RightButton, {}, QPoint(10, 5));
    QTest::qWait(100);
    return entries;
}

void TestRkPropertiesPane::followsSelectionWithOneRebuild()
{
    QSignalSpy rebuilds(pane(), &RkPropertiesPane::listsRebuilt);
    QCOMPARE(caption(), QStringLiteral("<None>"));
    QVERIFY(!pane()->findChild<QWidget*>(QStringLiteral("FavoritesDivider"))->isVisible());
    QVERIFY(!pane()->getFavoritesList()->isVisible());

    RkNode* prop = ball();
    rkScene->selectNode(m_figure);
    rkScene->selectNode(prop);
    rkScene->selectNode(m_bone);
    QCOMPARE(rebuilds.count(), 0);
    QCoreApplication::processEvents();
    QCOMPARE(rebuilds.count(), 1);
    QCOMPARE(caption(), QStringLiteral("Demo Figure : ") + m_bone->getLabel());
    // Neither text is cut by the other, whatever the font.
    const QLabel* captionLabel = pane()->findChildren<QLabel*>().at(0);
    QVERIFY(captionLabel->width() >= captionLabel->sizeHint().width());
    QVERIFY(pane()->findChildren<QLabel*>().at(1)->x() >=
            captionLabel->x() + captionLabel->sizeHint().width());
    QVERIFY(pane()->getFavoritesList()->isVisible());
    QVERIFY(pane()->getFavoritesList()->getGroup(QStringLiteral("Figure Favorites"), false));

    rkScene->selectNode(prop, true);
    QCoreApplication::processEvents();
    QCOMPARE(caption(), QStringLiteral("<Multiple>"));

    // A shown node that goes away leaves the pane working.
    rkScene->removeNode(prop);
    QCoreApplication::processEvents();
    QCOMPARE(caption(), QStringLiteral("Demo Figure : ") + m_bone->getLabel());
}

void TestRkPropertiesPane::loadRebuildsOnceAtTheEnd()
{
    QTemporaryDir dir;
    const QString file = dir.filePath(QStringLiteral("scene.rks"));
    QVERIFY(rkScene->save(file));
    QSignalSpy rebuilds(pane(), &RkPropertiesPane::listsRebuilt);

    // The loaded nodes get selected and the event loop runs while the load is still going.
    QMetaObject::Connection midLoad = connect(rkScene, &RkScene::nodeAdded, this, [](RkNode* node) {
        if (node->getLabel() == QLatin1String("Ball"))
            rkScene->selectNode(node);
        QCoreApplication::processEvents();
    });
    QVERIFY(rkScene->load(file));
    disconnect(midLoad);
    QCOMPARE(rebuilds.count(), 0);
    QCoreApplication::processEvents();
    QCOMPARE(rebuilds.count(), 1);
    QCOMPARE(caption(), QStringLiteral("Ball"));
}

void TestRkPropertiesPane::favoritesMenu_data()
{
    QTest::addColumn<bool>("onFigure");
    QTest::addColumn<int>("first");  // flags of the first selected property: 1 local, 2 figure
    QTest::addColumn<int>("second"); // of the second, or -1 for none
    QTest::addColumn<QStringList>("entries");

    const QString addFigure = QStringLiteral("Add Selected Properties to Figure Favorites");
    const QString addLocal = QStringLiteral("Add Selected Properties to Local Favorites");
    const QString removeFigure = QStringLiteral("Remove Selected Properties from Figure Favorites");
    const QString removeLocal = QStringLiteral("Remove Selected Properties from Local Favorites");
    QTest::newRow("local only") << true << 1 << -1
                                << QStringList{addFigure, QStringLiteral("|"), removeLocal};
    QTest::newRow("figure and local") << true << 2 << 1 << QStringList{removeFigure, removeLocal};
    QTest::newRow("neither with both")
        << true << 0 << 3
        << QStringList{addFigure, addLocal, QStringLiteral("|"), removeFigure, removeLocal};
    QTest::newRow("no figure shown") << false << 2 << -1 << QStringList{addLocal};
}

void TestRkPropertiesPane::favoritesMenu()
{
    QFETCH(bool, onFigure);
    QFETCH(int, first);
    QFETCH(int, second);
    QFETCH(QStringList, entries);

    RkNode* node = onFigure ? static_cast<RkNode*>(m_bone) : ball();
    RkProperty* a = node->findProperty(QStringLiteral("XRotate"));
    RkProperty* b = node->findProperty(QStringLiteral("YRotate"));
    a->setIsFavorite(first & 1);
    a->setIsGlobalFavorite(first & 2);
    b->setIsFavorite(second > 0 && (second & 1));
    b->setIsGlobalFavorite(second > 0 && (second & 2));
    rkScene->selectNode(node);
    QCoreApplication::processEvents();

    RkPropertyPaneList* list = pane()->getPropertiesList();
    RkPropertyWgt* widget = widgetOf(list, a);
    QVERIFY(widget);
    if (second >= 0) {
        RkPropertyWgt* other = widgetOf(list, b);
        QTest::mouseClick(other, Qt::LeftButton, Qt::ControlModifier, QPoint(10, 5));
        QTest::mouseClick(widget, Qt::LeftButton, Qt::ControlModifier, QPoint(10, 5));
    }
    QCOMPARE(rightClickMenu(widget), entries);
}

void TestRkPropertiesPane::addingToFavoritesMovesTheProperty()
{
    rkScene->selectNode(m_bone);
    QCoreApplication::processEvents();
    RkProperty* property = m_bone->findProperty(QStringLiteral("XRotate"));
    RkPropertyWgt* widget = widgetOf(pane()->getPropertiesList(), property);
    QTest::mouseClick(widget, Qt::LeftButton, {}, QPoint(10, 5));
    QVERIFY(widget->isSelected());

    m_window->getActionMgr()->findAction(QStringLiteral("RkGlobalFavoritesAddAction"))->trigger();
    QVERIFY(property->isGlobalFavorite());
    QVERIFY(!widget->isSelected());
    QCoreApplication::processEvents();
    RkPropertyWgt* favorite = widgetOf(pane()->getFavoritesList(), property);
    QVERIFY(favorite);
    QVERIFY(pane()
                ->getFavoritesList()
                ->getGroup(QStringLiteral("Figure Favorites"), false)
                ->isAncestorOf(favorite));

    // Removing it hides its group at once, before the rebuild.
    QTest::mouseClick(favorite, Qt::LeftButton, {}, QPoint(10, 5));
    m_window->getActionMgr()
        ->findAction(QStringLiteral("RkGlobalFavoritesRemoveAction"))
        ->trigger();
    QVERIFY(!property->isGlobalFavorite());
    QVERIFY(!favorite->isVisible());
}

void TestRkPropertiesPane::settingsRoundTrip()
{
    RkPropertiesPane* p = pane();
    auto* showHidden =
        m_window->getActionMgr()->findAction(QStringLiteral("RkShowHiddenPropAction"));
    QSignalSpy hiddenChanged(p, &RkPropertiesPane::showingHiddenChanged);
    showHidden->trigger();
    QVERIFY(p->showingHidden());
    QVERIFY(showHidden->isChecked());
    p->showHidden(true);
    QCOMPARE(hiddenChanged.count(), 1);
    QVERIFY(showHidden->isChecked());
    m_window->getActionMgr()->findAction(QStringLiteral("RkMouseOverSliderAction"))->trigger();
    QVERIFY(p->isSliderMouseOver());
    rkScene->selectNode(m_bone);
    QCoreApplication::processEvents();
    p->toggleFavsListHeight();
    QVERIFY(!p->getFavoritesList()->isVisible());
    // Rebuilds keep the folded list folded.
    p->toggleShowHidden();
    p->toggleShowHidden();
    QVERIFY(!p->getFavoritesList()->isVisible());

    RkPaneSettings saved(QStringLiteral("RkPropertiesPane"));
    p->saveSettings(saved);
    QTemporaryDir dir;
    QSettings store(dir.filePath(QStringLiteral("panes.ini")), QSettings::IniFormat);
    saved.store(store);
    RkPaneSettings loaded(QStringLiteral("RkPropertiesPane"));
    loaded.load(store);

    RkPropertiesPane fresh;
    fresh.setMouseOverSlider(false);
    fresh.restoreSettings(loaded);
    QVERIFY(fresh.showingHidden());
    QVERIFY(fresh.isSliderMouseOver());
    fresh.saveSettings(saved);
    QCOMPARE(saved.getBoolValue(QStringLiteral("MinimizeFavorites")), true);

    // A missing key turns mouse-over sliders off, although a new pane starts with them on.
    RkPropertiesPane other;
    QVERIFY(other.isSliderMouseOver());
    other.restoreSettings(RkPaneSettings(QStringLiteral("RkPropertiesPane")));
    QVERIFY(!other.isSliderMouseOver());
}

void TestRkPropertiesPane::optionsMenuListsHostActions()
{
    QCOMPARE(pane()->getOptionsMenuVersion(), 5);
    const QStringList expected = {"Memorize:",
                                  "RkMemorizeFigureAction",
                                  "RkMemorizeFigurePoseAction",
                                  "RkMemorizeFigureMorphsAction",
                                  "|",
                                  "RkMemorizeSelectedItemsAction",
                                  "RkMemorizeTransformsAction",
                                  "/",
                                  "Restore:",
                                  "RkRestoreFigureAction",
                                  "RkRestoreFigurePoseAction",
                                  "RkRestoreFigureMorphsAction",
                                  "|",
                                  "RkRestoreSelectedItemsAction",
                                  "RkRestoreTransformsAction",
                                  "/",
                                  "Zero:",
                                  "RkZeroFigureAction",
                                  "RkZeroFigurePoseAction",
                                  "RkZeroFigureMorphsAction",
                                  "|",
                                  "RkZeroSelectedItemsAction",
                                  "RkZeroTransformsAction",
                                  "/",
                                  "Clear Animation:",
                                  "RkClearKeysFigureAction",
                                  "RkClearKeysFigurePoseAction",
                                  "RkClearKeysFigureMorphsAction",
                                  "|",
                                  "RkClearKeysSelectedItemsAction",
                                  "RkClearKeysTransformsAction",
                                  "/",
                                  "|",
                                  "Limits:",
                                  "RkLimitsOnAction",
                                  "RkLimitsOffAction",
                                  "/",
                                  "Lock:",
                                  "RkLockNodeAction",
                                  "RkUnlockNodeAction",
                                  "|",
                                  "RkLockMorphsAction",
                                  "RkUnlockMorphsAction",
                                  "|",
                                  "RkLockTransformsAction",
                                  "RkUnlockTransformsAction",
                                  "/",
                                  "|",
                                  "RkSymmetryAction",
                                  "|",
                                  "RkMoveToFloorAction",
                                  "|",
                                  "RkShowHiddenPropAction",
                                  "RkMouseOverSliderAction"};
    QCOMPARE(entriesOf(pane()->getOptionsMenu()), expected);
}

void TestRkPropertiesPane::favoritesActionOutlivesThePane()
{
    RkFavoritesAddAction action;
    rkScene->selectNode(m_bone);
    QCoreApplication::processEvents();
    RkProperty* property = m_bone->findProperty(QStringLiteral("XRotate"));
    QTest::mouseClick(widgetOf(pane()->getPropertiesList(), property), Qt::LeftButton, {},
                      QPoint(10, 5));
    action.executeAction();
    QVERIFY(property->isFavorite());

    // The pane goes with its window; the action looks again and finds none.
    m_window.reset();
    QTest::ignoreMessage(QtWarningMsg, "No RkPropertiesPane instance could be found in "
                                       "RkFavoritesPropAction::executeAction()");
    action.executeAction();
    m_window = rkMakeTestMainWindow();
}

void TestRkPropertiesPane::filterListsMatchingProperties()
{
    rkScene->selectNode(m_bone);
    QCoreApplication::processEvents();
    RkPropertyPaneList* list = pane()->getPropertiesList();
    m_window->resize(1024, 400);
    QScrollBar* scroll = list->verticalScrollBar();
    QTRY_VERIFY(scroll->maximum() > 0);
    // The user scrolls once the list has settled (its posted scroll event included).
    QCoreApplication::processEvents();
    scroll->setValue(scroll->maximum());
    const int remembered = scroll->value();
    RkProperty* xRotate = m_bone->findProperty(QStringLiteral("XRotate"));
    RkProperty* yRotate = m_bone->findProperty(QStringLiteral("YRotate"));

    auto* field = pane()->findChild<QLineEdit*>(QStringLiteral("FilterField"));
    QTest::keyClicks(field, QStringLiteral("x rOT"));
    QCoreApplication::processEvents();
    QVERIFY(widgetOf(list, xRotate));
    QVERIFY(!widgetOf(list, yRotate));
    QVERIFY(list->getGroup(QStringLiteral("Transforms"), false));
    QCOMPARE(scroll->value(), 0);

    field->clear();
    QTRY_VERIFY(widgetOf(list, yRotate));
    QTRY_COMPARE(scroll->value(), remembered);
}

RK_TEST_MAIN(TestRkPropertiesPane)

#include "tst_rkpropertiespane.moc"
