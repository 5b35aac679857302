#include "demo/rkdemoscene.h"
#include "properties/rkboolproperty.h"
#include "properties/rkfloatproperty.h"
#include "properties/rkpropertygroup.h"
#include "properties/rkpropertygrouptree.h"
#include "rklabelpropertywgt.h"
#include "rkpropertypanelist.h"
#include "rktestmain.h"
#include "scene/rkbone.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostack.h"
#include "widgets/rkfloatpropertywgt.h"
#include "widgets/rkfloatslider.h"
#include "widgets/rkslider.h"
#include "widgets/rkwidgetgroup.h"

#include <QCheckBox>
#include <QLabel>
#include <QScrollBar>

#include <algorithm>
#include <memory>

namespace
{

// A node with its transforms and `extra` float properties in the group of the same name.
RkNode* addNode(const QString& name, const QString& extraGroup, int extra)
{
    auto* node = new RkNode;
    node->setObjectName(name);
    node->setLabel(name);
    for (int i = 0; i < extra; ++i) {
        node->addProperty(
            new RkFloatProperty(QStringLiteral("p%1").arg(i), QStringLiteral("Value %1").arg(i)),
            extraGroup);
    }
    rkScene->addNode(node);
    return node;
}

// What the pane does on a selection change.
void rebuild(RkPropertyPaneList* list)
{
    list->saveViewState();
    list->clear();
    RkNodeListIterator it = rkScene->selectedNodeListIterator();
    while (it.hasNext())
        list->addPropertyGroups(it.next()->getPropertyGroups(), false);
    list->finishBuild();
    list->restoreViewState();
    QCoreApplication::processEvents();
}

// The favourites list's part of a rebuild, figure favourites included.
void rebuildFavorites(RkPropertyPaneList* list)
{
    list->clear();
    RkNodeListIterator it = rkScene->selectedNodeListIterator();
    while (it.hasNext()) {
        RkNode* node = it.next();
        if (RkSkeleton* skeleton = node->getSkeleton()) {
            QList<RkBone*> bones;
            skeleton->getAllBones(bones);
            for (RkBone* bone : bones)
                list->addFigureFavorites(bone->getPropertyGroups(), bone, false);
            list->addFigureFavorites(skeleton->getPropertyGroups(), skeleton, false);
        }
        list->addPropertyGroups(node->getPropertyGroups(), false);
        list->finishBuild();
        list->deactivateEmptySubGroups(QStringLiteral("Figure Favorites"));
    }
}

RkPropertyWgt* widgetOf(RkPropertyPaneList* list, RkProperty* property)
{
    for (RkPropertyWgt* widget : list->findChildren<RkPropertyWgt*>()) {
        if (widget->getProperties().contains(property))
            return widget;
    }
    return nullptr;
}

// The visible widgets of a group, in order.
QList<RkPropertyWgt*> widgetsIn(RkWidgetGroup* group)
{
    QList<RkPropertyWgt*> widgets;
    QListIterator<QWidget*> it = group->widgetListIterator();
    while (it.hasNext())
        widgets.append(qobject_cast<RkPropertyWgt*>(it.next()));
    return widgets;
}

// What a user sees of a list, top to bottom: group headers (folded or not) and each property
// widget's label and value, with their heights in the list.
QStringList seen(RkPropertyPaneList* list)
{
    QStringList lines;
    for (QWidget* widget : list->widget()->findChildren<QWidget*>()) {
        if (!widget->isVisibleTo(list))
            continue;
        QString text;
        if (auto* group = qobject_cast<RkWidgetGroup*>(widget)) {
            text = QStringLiteral("[%1]%2").arg(group->text(),
                                                group->isCollapsed() ? QStringLiteral(" +") : "");
        } else if (auto* slider = qobject_cast<RkSlider*>(widget)) {
            text = slider->getLabel() + QStringLiteral(" = ") + slider->getValueText();
        } else if (auto* box = qobject_cast<QCheckBox*>(widget)) {
            text = box->text() + QStringLiteral(" = %1").arg(int(box->checkState()));
        } else {
            continue;
        }
        const QPoint at = widget->mapTo(list->widget(), QPoint());
        lines.append(QStringLiteral("%1 %2 %3 %4")
                         .arg(at.y(), 5, 10, QLatin1Char('0'))
                         .arg(at.x(), 3, 10, QLatin1Char('0'))
                         .arg(widget->height())
                         .arg(text));
    }
    lines.sort();
    return lines;
}

void clickHeader(RkWidgetGroup* group)
{
    QWidget* header = group->childAt(QPoint(40, 4));
    QVERIFY(header);
    QTest::mouseClick(header, Qt::LeftButton, {}, QPoint(40, 4));
}

} // namespace

class TestRkPropertyPaneList : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init();
    void cleanup();

    void mergesEqualPropertiesAndReusesWidgets();
    void favoritesAndPlaceholders();
    void poolLimitIsLoggedOnce();
    void nodeDeletedWhileShown();
    void clickSelection();
    void viewStateComesBack();
    void viewStateOfForgottenAndNewNodes();
    void reusedGroupFoldsOnlyItsOwnPropertyGroup();
    void rebuiltListLooksLikeANewOne_data();
    void rebuiltListLooksLikeANewOne();
    void clearedListShowsNothingOnceTheEventLoopRuns();

private:
    std::unique_ptr<QWidget> window;
    RkPropertyPaneList* list = nullptr;
    RkNode* a = nullptr;
    RkNode* b = nullptr;
};

void TestRkPropertyPaneList::init()
{
    rkScene->clear();
    a = addNode(QStringLiteral("A"), QStringLiteral("Only A"), 20);
    b = addNode(QStringLiteral("B"), QStringLiteral("Only B"), 20);
    window = std::make_unique<QWidget>();
    list = new RkPropertyPaneList(window.get(), QStringLiteral("PropertiesList"));
    list->setShowFavorites(false);
    list->resize(300, 240);
    window->resize(300, 240);
    window->show();
    QVERIFY(QTest::qWaitForWindowExposed(window.get()));
    rkUndoStack->clear();
}

void TestRkPropertyPaneList::cleanup()
{
    window.reset();
    rkScene->clear();
}

void TestRkPropertyPaneList::mergesEqualPropertiesAndReusesWidgets()
{
    rkScene->selectNode(a);
    rkScene->selectNode(b, true);
    rebuild(list);
    QCOMPARE(list->getGroup(QStringLiteral("/Transforms/Translation"), false),
             list->getGroup(QStringLiteral("Transforms/Translation"), false));
    QVERIFY(list->getGroup(QStringLiteral("Only A"), false));

    auto* xa = static_cast<RkFloatProperty*>(a->findProperty(QStringLiteral("XTranslate")));
    auto* xb = static_cast<RkFloatProperty*>(b->findProperty(QStringLiteral("XTranslate")));
    RkPropertyWgt* shared = widgetOf(list, xa);
    QVERIFY(shared);
    QCOMPARE(widgetOf(list, xb), shared);
    QCOMPARE(widgetsIn(list->getGroup(QStringLiteral("Transforms/Translation"), false)).size(), 3);

    // One drag writes both nodes in one undo entry.
    list->ensureWidgetVisible(shared);
    auto* slider = shared->findChild<RkFloatSlider*>();
    const QPoint from = slider->calcSliderRect().center();
    QTest::mousePress(slider, Qt::LeftButton, {}, from);
    QMouseEvent move(QEvent::MouseMove, from + QPoint(20, 0), slider->mapToGlobal(from),
                     Qt::NoButton, Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(slider, &move);
    QTest::mouseRelease(slider, Qt::LeftButton, {}, from + QPoint(20, 0));
    QVERIFY(xa->getValue() != 0.0f);
    QCOMPARE(xb->getValue(), xa->getValue());
    QCOMPARE(rkUndoStack->count(), 1);

    // After A and then B have each been shown, switching between them makes no widget of any
    // kind (groups, property widgets, their sliders and boxes) and deletes none.
    rkScene->selectNode(a);
    rebuild(list);
    rkScene->selectNode(b);
    rebuild(list);
    const auto allWidgets = [this] {
        QList<QWidget*> widgets = list->findChildren<QWidget*>();
        std::sort(widgets.begin(), widgets.end());
        return widgets;
    };
    const QList<QWidget*> made = allWidgets();
    for (RkNode* node : {a, b, a, b}) {
        rkScene->selectNode(node);
        rebuild(list);
    }
    QCOMPARE(allWidgets(), made);
    QVERIFY(!list->getGroup(QStringLiteral("Only A"), false));
    QCOMPARE(widgetsIn(list->getGroup(QStringLiteral("Only B"), false)).size(), 20);
}

void TestRkPropertyPaneList::favoritesAndPlaceholders()
{
    RkSkeleton* figure = rkBuildDemoScene(rkScene);
    QList<RkBone*> bones;
    figure->getAllBones(bones);
    RkBone* bone = bones.at(1);
    list->setShowFavorites(true);
    list->setShowAllGroups(false);
    const QString placeholder = QStringLiteral("Right Click a Property to Add it Here");

    rkScene->selectNode(figure);
    rebuildFavorites(list);
    for (const QString& path :
         {QStringLiteral("Local Favorites"), QStringLiteral("Figure Favorites")}) {
        const QList<RkPropertyWgt*> widgets = widgetsIn(list->getGroup(path, false));
        QCOMPARE(widgets.size(), 1);
        QVERIFY(qobject_cast<RkLabelPropertyWgt*>(widgets[0]));
        QCOMPARE(widgets[0]->findChild<QLabel*>()->text(), placeholder);
    }
    QVERIFY(!list->getGroup(QStringLiteral("Transforms"), false));

    // A local favourite is listed once; a bone's figure favourite under the bone's label, and
    // also under "Local Favorites" when it is a local favourite too.
    RkProperty* scale = figure->findProperty(QStringLiteral("Scale"));
    scale->setIsFavorite(true);
    RkProperty* bend = nullptr;
    for (RkProperty* property : bone->getProperties()) {
        if (!bend && !property->isHidden())
            bend = property;
    }
    bend->setIsGlobalFavorite(true);
    bend->setIsFavorite(true);
    rebuildFavorites(list);
    const QList<RkPropertyWgt*> locals =
        widgetsIn(list->getGroup(QStringLiteral("Local Favorites"), false));
    QCOMPARE(locals.size(), 2);
    QCOMPARE(locals[0]->getFirstProperty(), bend);
    QCOMPARE(locals[1]->getFirstProperty(), scale);
    const QList<RkPropertyWgt*> figureFavorites =
        widgetsIn(list->getGroup(QStringLiteral("Figure Favorites/") + bone->getLabel(), false));
    QCOMPARE(figureFavorites.size(), 1);
    QCOMPARE(figureFavorites[0]->getFirstProperty(), bend);

    rkScene->selectNode(a);
    rebuildFavorites(list);
    QVERIFY(!list->getGroup(QStringLiteral("Figure Favorites"), false));
    QCOMPARE(widgetsIn(list->getGroup(QStringLiteral("Local Favorites"), false)).size(), 1);
}

void TestRkPropertyPaneList::poolLimitIsLoggedOnce()
{
    const QString message = QStringLiteral("Parameters list maximum size has been exceeded!");
    RkNode* many = addNode(QStringLiteral("Many"), QStringLiteral("Many"), 800);
    rkScene->selectNode(many);
    RkPropertyPaneList other(nullptr, QStringLiteral("Other"));
    for (RkPropertyPaneList* each : {list, &other, list}) {
        rebuild(each);
        QCOMPARE(each->findChildren<RkFloatPropertyWgt*>().size(), 769);
    }
    QCOMPARE(rkApp->getLog().count(message), 1);
    // The rest of the list is still built.
    QVERIFY(list->getGroup(QStringLiteral("General"), false));
}

void TestRkPropertyPaneList::nodeDeletedWhileShown()
{
    rkScene->selectNode(a);
    rkScene->selectNode(b, true);
    rebuild(list);
    RkPropertyWgt* shared = widgetOf(list, b->findProperty(QStringLiteral("Scale")));
    QPointer<RkPropertyWgt> onlyA = widgetOf(list, a->findProperty(QStringLiteral("p0")));
    QTest::mouseClick(onlyA, Qt::LeftButton, {}, QPoint(1, 1));

    rkScene->removeNode(a);
    QVERIFY(onlyA);
    QVERIFY(!onlyA->getFirstProperty());
    QCOMPARE(shared->getProperties().size(), 1);
    QTest::mouseClick(onlyA, Qt::LeftButton, {}, QPoint(1, 1));
    QTest::mouseClick(shared, Qt::LeftButton, Qt::ShiftModifier, QPoint(1, 1));

    rebuild(list);
    QVERIFY(!list->getGroup(QStringLiteral("Only A"), false));
    QVERIFY(list->getGroup(QStringLiteral("Only B"), false));
}

void TestRkPropertyPaneList::clickSelection()
{
    rkScene->selectNode(a);
    rebuild(list);
    const QList<RkPropertyWgt*> w = widgetsIn(list->getGroup(QStringLiteral("Only A"), false));
    QSignalSpy cleared(list, &RkPropertyPaneList::selectionCleared);
    auto selected = [&] {
        QList<int> indexes;
        for (int i = 0; i < w.size(); ++i) {
            if (w[i]->isSelected())
                indexes.append(i);
        }
        return indexes;
    };
    auto click = [](QWidget* widget, Qt::KeyboardModifiers modifiers,
                    Qt::MouseButton button = Qt::LeftButton) {
        QTest::mouseClick(widget, button, modifiers, QPoint(1, 1));
    };

    // Shift-click with no earlier click selects to the end of the list.
    click(w[17], Qt::ShiftModifier);
    QCOMPARE(selected(), QList<int>({17, 18, 19}));
    QCOMPARE(cleared.count(), 0);

    click(w[2], {});
    QCOMPARE(selected(), QList<int>({2}));
    QCOMPARE(cleared.count(), 1);
    click(w[5], Qt::ShiftModifier);
    QCOMPARE(selected(), QList<int>({2, 3, 4, 5}));
    click(w[8], Qt::ControlModifier);
    click(w[3], Qt::ControlModifier | Qt::ShiftModifier);
    QCOMPARE(selected(), QList<int>({2, 4, 5, 8}));
    // The Ctrl-clicked widget became the anchor.
    click(w[1], Qt::ShiftModifier);
    QCOMPARE(selected(), QList<int>({1, 2, 3, 4, 5, 8}));
    QCOMPARE(list->getSelectedWidgets().size(), 6);

    // A right click on a selected widget keeps the selection, on another one selects only it.
    QVERIFY(!list->rightClicked());
    click(w[4], Qt::ControlModifier, Qt::RightButton);
    QVERIFY(list->rightClicked());
    QCOMPARE(selected().size(), 6);
    list->clearRightClicked();
    click(w[10], {}, Qt::RightButton);
    QVERIFY(list->rightClicked());
    QCOMPARE(selected(), QList<int>({10}));

    rebuild(list);
    QCOMPARE(list->getSelectedWidgets().size(), 0);
}

void TestRkPropertyPaneList::viewStateComesBack()
{
    rkScene->selectNode(a);
    rebuild(list);
    list->verticalScrollBar()->setValue(150);
    RkWidgetGroup* rotation = list->getGroup(QStringLiteral("Transforms/Rotation"), false);
    clickHeader(rotation);
    QVERIFY(rotation->isCollapsed());

    rkScene->selectNode(b);
    rebuild(list);
    list->verticalScrollBar()->setValue(20);
    QVERIFY(!list->getGroup(QStringLiteral("Transforms/Rotation"), false)->isCollapsed());

    rkScene->selectNode(a);
    rebuild(list);
    QCOMPARE(list->verticalScrollBar()->value(), 150);
    QVERIFY(list->getGroup(QStringLiteral("Transforms/Rotation"), false)->isCollapsed());

    rkScene->selectNode(b);
    rebuild(list);
    QCOMPARE(list->verticalScrollBar()->value(), 20);
    QVERIFY(!list->getGroup(QStringLiteral("Transforms/Rotation"), false)->isCollapsed());

    // A cleared scene forgets every state.
    list->forgetAllViewStates();
    list->verticalScrollBar()->setValue(0);
    rkScene->selectNode(a);
    rebuild(list);
    QCOMPARE(list->verticalScrollBar()->value(), 0);
}

void TestRkPropertyPaneList::viewStateOfForgottenAndNewNodes()
{
    // A node forgotten while shown gets no state from the next save.
    rkScene->selectNode(a);
    rebuild(list);
    list->verticalScrollBar()->setValue(150);
    list->forgetViewState(a);
    rkScene->selectNode(b);
    rebuild(list);
    list->verticalScrollBar()->setValue(0);
    rkScene->selectNode(a);
    rebuild(list);
    QCOMPARE(list->verticalScrollBar()->value(), 0);

    // A node shown for the first time does not stop the nodes after it from getting theirs.
    RkNode* c = addNode(QStringLiteral("C"), QStringLiteral("Only C"), 3);
    rkScene->selectNode(b);
    rebuild(list);
    list->verticalScrollBar()->setValue(150);
    rkScene->selectNode(a);
    rebuild(list);
    list->verticalScrollBar()->setValue(0);
    rkScene->selectNode(c);
    rkScene->selectNode(b, true);
    rebuild(list);
    QCOMPARE(list->verticalScrollBar()->value(), 150);
}

void TestRkPropertyPaneList::reusedGroupFoldsOnlyItsOwnPropertyGroup()
{
    RkPropertyGroup* onlyA = a->getPropertyGroups()->findChild(QStringLiteral("Only A"));
    RkPropertyGroup* onlyB = b->getPropertyGroups()->findChild(QStringLiteral("Only B"));
    rkScene->selectNode(a);
    rebuild(list);
    RkWidgetGroup* group = list->getGroup(QStringLiteral("Only A"), false);
    rkScene->selectNode(b);
    rebuild(list);
    QCOMPARE(list->getGroup(QStringLiteral("Only B"), false), group);

    clickHeader(group);
    QVERIFY(onlyB->getCollapsed());
    QVERIFY(!onlyA->getCollapsed());
    clickHeader(group);
    QVERIFY(!onlyB->getCollapsed());
}

void TestRkPropertyPaneList::rebuiltListLooksLikeANewOne_data()
{
    QTest::addColumn<QStringList>("selections"); // node names, "+" joins a multiple selection
    QTest::newRow("A, then B") << QStringList{"A", "B"};
    QTest::newRow("B, A, then B again") << QStringList{"B", "A", "B"};
    QTest::newRow("A with B, then C") << QStringList{"A+B", "C"};
    QTest::newRow("C, then A with B") << QStringList{"C", "A+B"};
    QTest::newRow("A, C, then A again") << QStringList{"A", "C", "A"};
    QTest::newRow("C, nothing, then B") << QStringList{"C", "", "B"};
    QTest::newRow("X, then Y") << QStringList{"X", "Y"};
    QTest::newRow("Y, then X") << QStringList{"Y", "X"};
}

// The pooled list, rebuilt again and again, shows exactly what a list built once for the last
// selection shows: the same groups and widgets in the same places, with the same texts.
void TestRkPropertyPaneList::rebuiltListLooksLikeANewOne()
{
    QFETCH(QStringList, selections);
    // C differs in shape: fewer groups and widgets, of other kinds, one group folded.
    RkNode* c = addNode(QStringLiteral("C"), QStringLiteral("Only C"), 3);
    c->addProperty(new RkBoolProperty(QStringLiteral("on"), QStringLiteral("Visible")),
                   QStringLiteral("Only C/Display"));
    c->getPropertyGroups()->findChild(QStringLiteral("Transforms"))->setCollapsed(true);
    // X and Y hold the same groups, filled unevenly: a group takes its widgets from the pool in
    // another order than it showed them before.
    for (const auto& shape :
         {qMakePair(QStringLiteral("X"), 3), qMakePair(QStringLiteral("Y"), 1)}) {
        RkNode* node = addNode(shape.first, QStringLiteral("One"), shape.second);
        for (int i = 0; i < 5 - shape.second; ++i) {
            node->addProperty(
                new RkFloatProperty(QStringLiteral("t%1").arg(i),
                                    QStringLiteral("%1 Two %2").arg(shape.first).arg(i)),
                QStringLiteral("Two"));
        }
    }
    for (RkProperty* property : b->getProperties()) {
        if (auto* number = qobject_cast<RkFloatProperty*>(property))
            number->setValue(number->getValue() + 0.5f);
    }
    const auto select = [](const QString& names) {
        rkScene->clearSelection();
        for (const QString& name : names.split(QLatin1Char('+'), Qt::SkipEmptyParts))
            rkScene->selectNode(rkScene->findNode(name), true);
    };
    for (const QString& names : selections) {
        select(names);
        rebuild(list);
    }
    window->resize(600, 240);
    auto* fresh = new RkPropertyPaneList(window.get(), QStringLiteral("Fresh"));
    fresh->setShowFavorites(false);
    fresh->setGeometry(300, 0, 300, 240);
    fresh->show();
    rebuild(fresh);
    QVERIFY(!seen(fresh).isEmpty());
    QTRY_COMPARE(seen(list), seen(fresh));
    QCOMPARE(list->widget()->height(), fresh->widget()->height());
    // Pooled widgets not in use are hidden, not merely out of sight.
    int shown = 0;
    for (RkPropertyWgt* widget : list->findChildren<RkPropertyWgt*>())
        shown += widget->isHidden() ? 0 : 1;
    QCOMPARE(shown, fresh->findChildren<RkPropertyWgt*>().size());
}

// Emptied and never filled (the favourites list has nothing to show without a selection): what
// the list showed goes once the event loop runs.
void TestRkPropertyPaneList::clearedListShowsNothingOnceTheEventLoopRuns()
{
    rkScene->selectNode(a);
    rebuild(list);
    QVERIFY(!seen(list).isEmpty());
    list->clear();
    QCoreApplication::processEvents();
    QCOMPARE(seen(list), QStringList());
    for (RkPropertyWgt* widget : list->findChildren<RkPropertyWgt*>())
        QVERIFY(widget->isHidden() || !widget->isVisibleTo(list));
    QVERIFY(list->widget()->minimumHeight() < 10);
}

RK_TEST_MAIN(TestRkPropertyPaneList)
#include "tst_rkpropertypanelist.moc"
