#include "rkdropdownview.h"

#include "properties/rkfloatproperty.h"
#include "properties/rkpropertygroup.h"
#include "properties/rkpropertygrouptree.h"
#include "rktestmain.h"

#include <QAbstractItemView>
#include <QComboBox>
#include <QSignalSpy>
#include <QStandardItemModel>

#include <algorithm>

namespace
{

// Every group of the tree as an item carrying its path, as the Shape tab fills its chooser.
void addGroups(RkPropertyGroup* group, QStandardItem* parent)
{
    for (; group; group = group->getNextSibling()) {
        auto* item = new QStandardItem(group->getName());
        parent->appendRow(item);
        addGroups(group->getFirstChild(), item);
    }
}

// The combo boxes on screen, top to bottom.
QList<QComboBox*> visibleCombos(RkDropDownView& view)
{
    QList<QComboBox*> combos;
    for (QComboBox* combo : view.findChildren<QComboBox*>()) {
        if (!combo->isHidden())
            combos.append(combo);
    }
    std::sort(combos.begin(), combos.end(),
              [](QComboBox* a, QComboBox* b) { return a->y() < b->y(); });
    return combos;
}

QStringList entries(QComboBox* combo)
{
    QStringList texts;
    for (int i = 0; i < combo->count(); ++i)
        texts << combo->itemText(i);
    return texts;
}

QModelIndex lastActivated(const QSignalSpy& spy)
{
    return spy.last().at(0).value<QModelIndex>();
}

} // namespace

class TestRkDropDownView : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void choosingByMouse();

private:
    // Opens the combo box's list with a click and clicks the entry.
    bool choose(QComboBox* combo, const QString& text);
};

bool TestRkDropDownView::choose(QComboBox* combo, const QString& text)
{
    const int row = combo->findText(text);
    if (row < 0)
        return false;
    QAbstractItemView* list = combo->view();
    // Other tests' windows share the X server, and their popups may close this one before the
    // click lands; the user then opens it again.
    for (int attempt = 0; attempt < 5; ++attempt) {
        QTest::mouseClick(combo, Qt::LeftButton);
        if (!QTest::qWaitFor([list] { return list->isVisible(); }))
            continue;
        // The list ignores a release that follows its opening too closely.
        QTest::qWait(QApplication::doubleClickInterval() + 50);
        const QRect r = list->visualRect(list->model()->index(row, 0));
        QTest::mouseClick(list->viewport(), Qt::LeftButton, Qt::NoModifier, r.center());
        if (QTest::qWaitFor([list] { return !list->isVisible(); }) && combo->currentIndex() == row)
            return true;
        if (list->isVisible())
            combo->hidePopup();
    }
    return false;
}

void TestRkDropDownView::choosingByMouse()
{
    RkPropertyGroupTree tree;
    RkFloatProperty scale("Scale", "Scale"), smile("Smile", "Smile"), belly("Belly", "Belly");
    tree.addProperty(&scale, "General");
    tree.addProperty(&smile, "Morphs/Head/Face");
    tree.addProperty(&belly, "Morphs/Body");
    QStandardItemModel model;
    addGroups(tree.getFirstChild(), model.invisibleRootItem());
    const QModelIndex morphs = model.index(1, 0);
    const QModelIndex face = model.index(0, 0, model.index(0, 0, morphs));
    const QModelIndex body = model.index(1, 0, morphs);

    RkDropDownView view;
    QSignalSpy spy(&view, &QAbstractItemView::activated);
    view.setModel(&model);
    view.resize(240, view.height());
    view.show();
    QVERIFY(QTest::qWaitForWindowExposed(&view));
    const int row = view.style()->pixelMetric(QStyle::PM_CustomBase) +
                    view.style()->pixelMetric(QStyle::PixelMetric(QStyle::PM_CustomBase + 10));
    QCOMPARE(view.minimumSizeHint().height(), 3 * row);

    // The first layout lists the top groups; leaving some out is the Shape tab's business.
    QTRY_COMPARE(spy.count(), 1);
    QVERIFY(!lastActivated(spy).isValid());
    QList<QComboBox*> combos = visibleCombos(view);
    QCOMPARE(combos.size(), 1);
    QCOMPARE(entries(combos[0]), (QStringList{"Make Selection", "General", "Morphs"}));
    QCOMPARE(view.height(), row);

    QVERIFY(choose(combos[0], "Morphs"));
    QCOMPARE(lastActivated(spy), morphs);
    combos = visibleCombos(view);
    QCOMPARE(combos.size(), 2);
    QCOMPARE(entries(combos[1]), (QStringList{"Make Selection", "Head", "Body"}));
    QVERIFY(choose(combos[1], "Head"));
    QVERIFY(choose(visibleCombos(view).value(2), "Face"));
    // A leaf adds no box on screen.
    QCOMPARE(lastActivated(spy), face);
    QCOMPARE(visibleCombos(view).size(), 3);
    QCOMPARE(view.height(), 3 * row);

    // Another choice higher up replaces everything below it.
    QVERIFY(choose(visibleCombos(view).value(1), "Body"));
    QCOMPARE(lastActivated(spy), body);
    QCOMPARE(visibleCombos(view).size(), 2);
    QCOMPARE(view.height(), 2 * row);

    // "Make Selection" steps back to the choice one level up.
    QVERIFY(choose(visibleCombos(view).value(1), "Make Selection"));
    QCOMPARE(lastActivated(spy), morphs);
    QCOMPARE(visibleCombos(view).size(), 2);
    QVERIFY(choose(visibleCombos(view).value(0), "Make Selection"));
    QVERIFY(!lastActivated(spy).isValid());
    QCOMPARE(visibleCombos(view).size(), 1);
    QCOMPARE(view.height(), row);
    QCOMPARE(spy.count(), 7);

    // An emptied model leaves one hidden box, one row high, and reports the root.
    model.clear();
    QTRY_COMPARE(spy.count(), 8);
    QVERIFY(!lastActivated(spy).isValid());
    // Dropped levels go first, their combo boxes after them.
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    QCOMPARE(view.findChildren<QComboBox*>().size(), 1);
    QVERIFY(visibleCombos(view).isEmpty());
    QCOMPARE(view.height(), row);
}

RK_TEST_MAIN(TestRkDropDownView)
#include "tst_rkdropdownview.moc"
