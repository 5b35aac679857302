// Mouse events go through the window, so a press that opens the list is followed as a user's is.
#define QTEST_QPA_MOUSE_HANDLING

#include "rktestmain.h"
#include "widgets/rkmenubutton.h"

#include <QMenu>

class TestRkMenuButton : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void picksByMouseAndByIndex();
};

void TestRkMenuButton::picksByMouseAndByIndex()
{
    QWidget window;
    RkMenuButton button(&window, QStringLiteral("RkUVView"), QString());
    button.setButtonStyle(RkStyledButton::DropDownStyle);
    QCOMPARE(button.insertItem(QStringLiteral("View by Material")), 0);
    QCOMPARE(button.insertItem(QStringLiteral("View by Node")), 1);
    QCOMPARE(button.insertItem(QStringLiteral("View by Shape"), 7, 1), 7);
    QCOMPARE(button.count(), 3);
    QCOMPARE(button.itemText(1), QStringLiteral("View by Shape"));
    QCOMPARE(button.itemId(2), 1);
    QCOMPARE(button.currentIndex(), -1);
    button.adjustSize();
    window.resize(300, 200);
    window.show();
    QVERIFY(QTest::qWaitForWindowExposed(&window));
    QSignalSpy selected(&button, &RkMenuButton::menuIndexSelected);

    // Selecting by index emits too, also for the item already current.
    button.selectItemAt(0);
    button.selectItemAt(0);
    button.selectItemAt(3);
    QCOMPARE(selected.count(), 2);
    QCOMPARE(selected.at(0).at(0).toInt(), 0);
    QCOMPARE(button.text(), QStringLiteral("View by Material"));

    // An item inserted before the current one leaves the same item current.
    button.insertItem(QStringLiteral("View All"), -1, 0);
    QCOMPARE(button.currentIndex(), 1);
    QCOMPARE(button.itemText(button.currentIndex()), QStringLiteral("View by Material"));

    // A press opens the list below the button with the current item checked; a click picks.
    QTest::mousePress(&button, Qt::LeftButton);
    auto* menu = qobject_cast<QMenu*>(QApplication::activePopupWidget());
    QVERIFY(menu);
    QTest::mouseRelease(&button, Qt::LeftButton);
    QVERIFY(menu->isVisible()); // the release of the opening press does not pick
    QCOMPARE(menu->actions().size(), 4);
    QVERIFY(menu->actions().at(1)->isChecked());
    QVERIFY(menu->geometry().top() >= button.mapToGlobal(QPoint(0, button.height() - 1)).y());
    QTest::mouseClick(menu, Qt::LeftButton, {},
                      menu->actionGeometry(menu->actions().at(3)).center());
    QTRY_VERIFY(!menu->isVisible());
    QCOMPARE(selected.count(), 3);
    QCOMPARE(selected.at(2).at(0).toInt(), 3);
    QCOMPARE(button.currentIndex(), 3);
    QCOMPARE(button.text(), QStringLiteral("View by Node"));
    // Wide enough for every item, whichever is shown.
    QVERIFY(button.sizeHint().width() >=
            button.fontMetrics().horizontalAdvance(QStringLiteral("View by Material")));
}

RK_TEST_MAIN(TestRkMenuButton)
#include "tst_rkmenubutton.moc"
