// Mouse events go through the window, so a click lands on the child under the pointer.
#define QTEST_QPA_MOUSE_HANDLING

#include "rktestmain.h"
#include "widgets/rkwidgetgroup.h"
#include "widgets/rkwidgetlistlayout.h"

#include <QLabel>
#include <QPointer>
#include <QScrollArea>

#include <algorithm>

namespace
{

// Groups in a scroll area whose content takes the layout's size, as a property list has them.
struct List {
    QScrollArea area;
    QWidget* content = new QWidget;
    RkWidgetListLayout* layout = new RkWidgetListLayout(content);

    List()
    {
        layout->setSizeConstraint(QLayout::SetMinAndMaxSize);
        layout->setContentsMargins(0, 0, 0, 0);
        layout->setSpacing(0);
        layout->setAlignment(Qt::AlignTop);
        area.setWidget(content);
        area.setWidgetResizable(true);
        area.resize(300, 500);
    }
    RkWidgetGroup* addGroup(const QString& text)
    {
        return new RkWidgetGroup(layout, text, QStringLiteral("WidgetGroup"), 0);
    }
    bool show()
    {
        area.show();
        return QTest::qWaitForWindowExposed(&area);
    }
};

QList<QWidget*> widgetsOf(const RkWidgetGroup* group)
{
    QList<QWidget*> widgets;
    for (auto it = group->widgetListIterator(); it.hasNext();)
        widgets.append(it.next());
    return widgets;
}

// Counts the show and hide events a widget gets.
class VisibilityEvents : public QObject
{
public:
    int count = 0;
    void watch(QWidget* widget) { widget->installEventFilter(this); }
    bool eventFilter(QObject*, QEvent* event) override
    {
        if (event->type() == QEvent::Show || event->type() == QEvent::Hide)
            ++count;
        return false;
    }
};

// The widgets a user sees in the group, top to bottom.
QList<QWidget*> shownInOrder(const RkWidgetGroup* group)
{
    QList<QWidget*> shown;
    for (QWidget* widget : widgetsOf(group)) {
        if (widget->isVisible())
            shown.append(widget);
    }
    std::sort(shown.begin(), shown.end(), [group](const QWidget* a, const QWidget* b) {
        return a->mapTo(group, QPoint()).y() < b->mapTo(group, QPoint()).y();
    });
    return shown;
}

QStringList subGroupTexts(const RkWidgetGroup* group)
{
    QStringList texts;
    for (auto it = group->groupListIterator(); it.hasNext();) {
        const RkWidgetGroup* sub = it.next();
        if (sub->isActive())
            texts.append(sub->text());
    }
    return texts;
}

} // namespace

class TestRkWidgetGroup : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void pathsFindCreateAndReuse();
    void collapsingHidesAndShowsTheSameWidgets();
    void removeAllChildrenEmptiesTheGroup();
    void movingAGroupToTheEnd();
    void refillKeepsWhatComesBackInPlace();
    void refillWithNewWidgetsShowsTheListOnce();
};

void TestRkWidgetGroup::pathsFindCreateAndReuse()
{
    List list;
    RkWidgetGroup* general = list.addGroup(QStringLiteral("General"));
    QCOMPARE(general->getGroup(QStringLiteral("Transforms/Rotation"), false),
             static_cast<RkWidgetGroup*>(nullptr));
    RkWidgetGroup* rotation = general->getGroup(QStringLiteral("Transforms/Rotation"), true);
    QVERIFY(rotation);
    QCOMPARE(rotation->text(), QStringLiteral("Rotation"));
    RkWidgetGroup* transforms = general->getGroup(QStringLiteral("Transforms"), false);
    QCOMPARE(transforms->getGroup(QStringLiteral("Rotation"), false), rotation);
    QCOMPARE(general->getGroup(QStringLiteral("/Transforms/Rotation/"), true), rotation);
    QCOMPARE(general->getNumGroups(), 1);
    QCOMPARE(general->getGroup(0), transforms);
    QCOMPARE(general->getGroup(1), static_cast<RkWidgetGroup*>(nullptr));

    // A group counts as filled by a widget or an active sub-group.
    QVERIFY(!rotation->hasChildren());
    QVERIFY(transforms->hasChildren());
    rotation->addWidget(new QLabel(QStringLiteral("X Rotate")));
    QVERIFY(rotation->hasChildren());

    // A deactivated group is no longer found; the next new group takes it, emptied and unfolded,
    // and comes after the groups still in use.
    RkWidgetGroup* scale = general->getGroup(QStringLiteral("Scale"), true);
    transforms->setCollapsed(true);
    QSignalSpy folded(transforms, &RkWidgetGroup::collapsedChanged);
    transforms->removeAllChildren();
    transforms->setActive(false);
    QCOMPARE(general->getGroup(QStringLiteral("Transforms"), false),
             static_cast<RkWidgetGroup*>(nullptr));
    RkWidgetGroup* morphs = general->getGroup(QStringLiteral("Morphs"), true);
    QCOMPARE(morphs, transforms);
    QCOMPARE(general->getNumGroups(), 2);
    QCOMPARE(subGroupTexts(general),
             QStringList({QStringLiteral("Scale"), QStringLiteral("Morphs")}));
    QVERIFY(morphs->isActive());
    QVERIFY(!morphs->isCollapsed());
    QVERIFY(!morphs->hasChildren());
    QCOMPARE(morphs->getGroup(QStringLiteral("Rotation"), false),
             static_cast<RkWidgetGroup*>(nullptr));
    QCOMPARE(folded.count(), 0); // the reset does not reach what the group showed before
    QVERIFY(scale->isActive());
}

void TestRkWidgetGroup::collapsingHidesAndShowsTheSameWidgets()
{
    List list;
    RkWidgetGroup* group = list.addGroup(QStringLiteral("Light"));
    auto* intensity = new QLabel(QStringLiteral("Intensity"));
    auto* colour = new QLabel(QStringLiteral("Colour"));
    group->addWidget(intensity);
    group->addWidget(colour);
    RkWidgetGroup* shadow = group->getGroup(QStringLiteral("Shadow"), true);
    auto* softness = new QLabel(QStringLiteral("Softness"));
    shadow->addWidget(softness);
    RkWidgetGroup* below = list.addGroup(QStringLiteral("Camera"));
    QVERIFY(list.show());
    for (QWidget* widget : {static_cast<QWidget*>(intensity), static_cast<QWidget*>(colour),
                            static_cast<QWidget*>(softness)})
        QVERIFY(widget->isVisible());
    // Sub-groups come before the group's own widgets and are indented.
    QVERIFY(shadow->mapTo(group, QPoint()).y() < intensity->mapTo(group, QPoint()).y());
    QVERIFY(shadow->mapTo(group, QPoint()).x() > 0);
    const int openHeight = list.content->minimumHeight();
    const int belowAt = below->y();

    QSignalSpy changed(group, &RkWidgetGroup::collapsedChanged);
    QTest::mouseClick(group, Qt::LeftButton, {}, QPoint(30, 5));
    QCOMPARE(changed.count(), 1);
    QCOMPARE(changed.at(0).at(0).toBool(), true);
    QVERIFY(group->isCollapsed());
    QVERIFY(group->isVisible());
    QVERIFY(!intensity->isVisible());
    QVERIFY(!colour->isVisible());
    QVERIFY(!shadow->isVisible());
    QVERIFY(!softness->isVisible());
    // The list gives the room back: the scroll range shrinks and the next group moves up.
    QTRY_VERIFY(list.content->minimumHeight() < openHeight);
    QTRY_VERIFY(below->y() < belowAt);

    QTest::mouseClick(group, Qt::LeftButton, {}, QPoint(30, 5));
    QCOMPARE(changed.count(), 2);
    QCOMPARE(changed.at(1).at(0).toBool(), false);
    QCOMPARE(widgetsOf(group), QList<QWidget*>({intensity, colour}));
    QVERIFY(intensity->isVisible());
    QVERIFY(colour->isVisible());
    QVERIFY(softness->isVisible());
    QTRY_COMPARE(list.content->minimumHeight(), openHeight);
    QTRY_COMPARE(below->y(), belowAt);

    // Setting the state it already has emits nothing; a click in the body does not fold.
    group->setCollapsed(false);
    QTest::mouseClick(intensity, Qt::LeftButton);
    QCOMPARE(changed.count(), 2);
}

void TestRkWidgetGroup::removeAllChildrenEmptiesTheGroup()
{
    List list;
    RkWidgetGroup* group = list.addGroup(QStringLiteral("Surface"));
    QPointer<QLabel> diffuse = new QLabel(QStringLiteral("Diffuse"));
    QPointer<QLabel> gloss = new QLabel(QStringLiteral("Gloss"));
    group->addWidget(diffuse);
    RkWidgetGroup* bump = group->getGroup(QStringLiteral("Bump"), true);
    bump->addWidget(gloss);
    QVERIFY(list.show());

    group->removeAllChildren();
    QVERIFY(widgetsOf(group).isEmpty());
    QVERIFY(!group->hasChildren());
    QVERIFY(!bump->isActive());
    QVERIFY(!bump->isVisible());
    QVERIFY(widgetsOf(bump).isEmpty());
    // The widgets are kept for their owner to use again, hidden, in the list's content widget.
    QVERIFY(diffuse && gloss);
    QVERIFY(!diffuse->isVisible());
    QCOMPARE(gloss->parentWidget(), list.content);

    // Taken into another group, a released widget shows again; the first group does not list it.
    RkWidgetGroup* other = list.addGroup(QStringLiteral("Other"));
    other->addWidget(gloss);
    QTRY_VERIFY(gloss->isVisible());
    group->addWidget(diffuse);
    other->addWidget(diffuse);
    QCOMPARE(widgetsOf(group), QList<QWidget*>());
    QCOMPARE(widgetsOf(other), QList<QWidget*>({gloss.data(), diffuse.data()}));
    delete gloss;
    QCOMPARE(widgetsOf(other), QList<QWidget*>({diffuse.data()}));
}

void TestRkWidgetGroup::movingAGroupToTheEnd()
{
    List list;
    RkWidgetGroup* top = list.addGroup(QStringLiteral("Top"));
    RkWidgetGroup* a = top->getGroup(QStringLiteral("A"), true);
    top->getGroup(QStringLiteral("B"), true);
    RkWidgetGroup* c = top->getGroup(QStringLiteral("C"), true);
    RkWidgetGroup* x = top->getGroup(QStringLiteral("A/X"), true);
    top->getGroup(QStringLiteral("A/Y"), true);
    QVERIFY(list.show());

    QVERIFY(top->moveWidgetListGroupToEnd(a));
    QCOMPARE(subGroupTexts(top), QStringList({"B", "C", "A"}));
    QTRY_VERIFY(a->y() > c->y());
    QVERIFY(top->moveWidgetListGroupToEnd(x)); // found two levels down
    QCOMPARE(subGroupTexts(a), QStringList({"Y", "X"}));

    QVERIFY(!top->moveWidgetListGroupToEnd(top));
    RkWidgetGroup* stranger = list.addGroup(QStringLiteral("Stranger"));
    QVERIFY(!top->moveWidgetListGroupToEnd(stranger));
    QCOMPARE(subGroupTexts(top), QStringList({"B", "C", "A"}));
}

void TestRkWidgetGroup::refillKeepsWhatComesBackInPlace()
{
    List list;
    RkWidgetGroup* group = list.addGroup(QStringLiteral("Light"));
    QList<QLabel*> labels;
    for (const char* text : {"Intensity", "Colour", "Range"}) {
        labels.append(new QLabel(QString::fromLatin1(text)));
        group->addWidget(labels.last());
    }
    RkWidgetGroup* shadow = group->getGroup(QStringLiteral("Shadow"), true);
    auto* softness = new QLabel(QStringLiteral("Softness"));
    shadow->addWidget(softness);
    RkWidgetGroup* other = list.addGroup(QStringLiteral("Other"));
    auto* note = new QLabel(QStringLiteral("Note"));
    other->addWidget(note);
    QVERIFY(list.show());
    VisibilityEvents events;
    for (QWidget* widget : {static_cast<QWidget*>(group), static_cast<QWidget*>(shadow),
                            static_cast<QWidget*>(list.content), static_cast<QWidget*>(softness),
                            static_cast<QWidget*>(labels[0]), static_cast<QWidget*>(labels[2])})
        events.watch(widget);

    // The same content again, less one widget and one group: nothing is hidden or shown but what
    // is left out, and the list is not hidden either.
    list.layout->beginRefill();
    group->release();
    other->release();
    QVERIFY(!group->isActive() && !group->hasChildren());
    QCOMPARE(group->getGroup(QStringLiteral("Shadow"), false),
             static_cast<RkWidgetGroup*>(nullptr));
    group->setActive(true);
    QCOMPARE(group->getGroup(QStringLiteral("Shadow"), true), shadow);
    shadow->addWidget(softness);
    group->addWidget(labels[0]);
    group->addWidget(labels[2]);
    group->settle();
    other->settle();
    list.layout->endRefill();
    QCOMPARE(events.count, 0);
    QCOMPARE(widgetsOf(group), QList<QWidget*>({labels[0], labels[2]}));
    QVERIFY(labels[1]->isHidden());
    QCOMPARE(labels[1]->parentWidget()->parentWidget(), group); // kept for its owner
    QVERIFY(!other->isVisible() && !other->isActive());
    QVERIFY(note->isHidden());
    QTRY_COMPARE(shownInOrder(group), QList<QWidget*>({labels[0], labels[2]}));
    // No gap where the left-out widget was (one pixel of spacing).
    QTRY_COMPARE(labels[2]->y(), labels[0]->geometry().bottom() + 2);
    QVERIFY(shadow->mapTo(group, QPoint()).y() < labels[0]->mapTo(group, QPoint()).y());

    // In another order, and with the left-out widget back: what a user sees follows the new order.
    list.layout->beginRefill();
    group->release();
    group->setActive(true);
    for (QLabel* label : {labels[2], labels[1], labels[0]})
        group->addWidget(label);
    group->settle();
    list.layout->endRefill();
    QCOMPARE(widgetsOf(group), QList<QWidget*>({labels[2], labels[1], labels[0]}));
    QVERIFY(!shadow->isVisible() && !softness->isVisible());
    QTRY_COMPARE(shownInOrder(group), QList<QWidget*>({labels[2], labels[1], labels[0]}));

    // Emptied for good, a released group hands everything back to the list's widget.
    group->release();
    group->removeAllChildren();
    for (QLabel* label : labels)
        QCOMPARE(label->parentWidget(), list.content);
}

void TestRkWidgetGroup::refillWithNewWidgetsShowsTheListOnce()
{
    List list;
    RkWidgetGroup* group = list.addGroup(QStringLiteral("Morphs"));
    QVERIFY(list.show());
    VisibilityEvents events;
    events.watch(list.content);
    list.layout->beginRefill();
    group->release();
    group->setActive(true);
    QList<QLabel*> labels;
    for (int i = 0; i < 40; ++i) {
        labels.append(new QLabel(QStringLiteral("Morph %1").arg(i)));
        group->addWidget(labels.last());
    }
    group->getGroup(QStringLiteral("Face"), true)->addWidget(new QLabel(QStringLiteral("Smile")));
    // Hidden at the first widget to show, shown at the end: two events, not one per widget.
    QCOMPARE(events.count, 1);
    QVERIFY(!list.content->isVisible());
    group->settle();
    list.layout->endRefill();
    QCOMPARE(events.count, 2);
    QVERIFY(list.content->isVisible());
    QTRY_COMPARE(shownInOrder(group), QList<QWidget*>(labels.cbegin(), labels.cend()));
    QVERIFY(list.content->minimumHeight() > 40 * labels[0]->height());
}

RK_TEST_MAIN(TestRkWidgetGroup)
#include "tst_rkwidgetgroup.moc"
