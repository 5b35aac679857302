// Mouse events go through the window: a drag keeps reaching the bar wherever the pointer goes.
#define QTEST_QPA_MOUSE_HANDLING

#include "rktestmain.h"
#include "widgets/rkdividerbar.h"

class TestRkDividerBar : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void dragDeltasAddUpToTheDistance_data();
    void dragDeltasAddUpToTheDistance();
    void clickTogglesAndDragDoesNot();
};

namespace
{

int sum(const QSignalSpy& spy)
{
    int total = 0;
    for (const QList<QVariant>& args : spy)
        total += args.at(0).toInt();
    return total;
}

} // namespace

void TestRkDividerBar::dragDeltasAddUpToTheDistance_data()
{
    QTest::addColumn<Qt::Orientation>("orientation");
    QTest::addColumn<bool>("toggle");
    QTest::addColumn<int>("distance");
    QTest::newRow("down") << Qt::Horizontal << false << 37;
    QTest::newRow("up, toggle bar") << Qt::Horizontal << true << -25;
    QTest::newRow("right") << Qt::Vertical << false << 30;
    QTest::newRow("left, toggle bar") << Qt::Vertical << true << -18;
}

void TestRkDividerBar::dragDeltasAddUpToTheDistance()
{
    QFETCH(Qt::Orientation, orientation);
    QFETCH(bool, toggle);
    QFETCH(int, distance);
    const bool horizontal = orientation == Qt::Horizontal;
    QWidget window;
    window.resize(300, 300);
    auto* bar = new RkDividerBar(&window, orientation, QStringLiteral("Divider"),
                                 RkDividerBar::GripToggleBar);
    bar->enableToggleBar(toggle);
    bar->setGeometry(horizontal ? QRect(0, 140, 300, 8) : QRect(140, 0, 8, 300));
    // The owner resizes its areas, so the bar moves under the pointer while it is dragged.
    const QPoint axis = horizontal ? QPoint(0, 1) : QPoint(1, 0);
    connect(bar, &RkDividerBar::moved, bar,
            [bar, axis](int delta) { bar->move(bar->pos() + axis * delta); });
    QSignalSpy moved(bar, &RkDividerBar::moved);
    QSignalSpy toggled(bar, &RkDividerBar::toggleBarActivated);
    window.show();
    QVERIFY(QTest::qWaitForWindowExposed(&window));

    const QPoint start = bar->mapToGlobal(horizontal ? QPoint(20, 4) : QPoint(4, 20));
    const QPoint startPos = bar->pos();
    QTest::mousePress(bar, Qt::LeftButton, {}, bar->mapFromGlobal(start));
    const int steps = 5;
    for (int i = 1; i <= steps; ++i)
        QTest::mouseMove(bar, bar->mapFromGlobal(start + axis * (distance * i / steps)));
    QTest::mouseRelease(bar, Qt::LeftButton, {}, bar->mapFromGlobal(start + axis * distance));

    QVERIFY(moved.count() > 1); // reported while dragging, not only at the end
    QCOMPARE(sum(moved), distance);
    QCOMPARE(bar->pos(), startPos + axis * distance);
    QCOMPARE(toggled.count(), 0);
}

void TestRkDividerBar::clickTogglesAndDragDoesNot()
{
    QWidget window;
    window.resize(300, 100);
    RkDividerBar bar(&window, Qt::Horizontal, QStringLiteral("FavoritesDivider"),
                     RkDividerBar::GripToggleBar);
    bar.setGeometry(0, 40, 300, 8);
    QSignalSpy moved(&bar, &RkDividerBar::moved);
    QSignalSpy toggled(&bar, &RkDividerBar::toggleBarActivated);
    window.show();
    QVERIFY(QTest::qWaitForWindowExposed(&window));
    const QPoint grip(20, 4);
    const QPoint button = bar.rect().center();

    QTest::mouseClick(&bar, Qt::LeftButton, {}, grip);
    QCOMPARE(toggled.count(), 0); // toggle bar not enabled yet

    bar.enableToggleBar(true);
    QTest::mouseClick(&bar, Qt::LeftButton, {}, grip);
    QCOMPARE(toggled.count(), 1);
    // A hand that shakes a pixel still clicks.
    QTest::mousePress(&bar, Qt::LeftButton, {}, grip);
    QTest::mouseMove(&bar, grip + QPoint(0, 1));
    QTest::mouseRelease(&bar, Qt::LeftButton, {}, grip + QPoint(0, 1));
    QCOMPARE(toggled.count(), 2);
    QCOMPARE(moved.count(), 0);

    QTest::mousePress(&bar, Qt::LeftButton, {}, grip);
    QTest::mouseMove(&bar, grip + QPoint(0, 20));
    QTest::mouseRelease(&bar, Qt::LeftButton, {}, grip + QPoint(0, 20));
    QCOMPARE(toggled.count(), 2);
    QCOMPARE(sum(moved), 20);

    // The toggle button clicks, and a press on it never drags.
    QTest::mouseClick(&bar, Qt::LeftButton, {}, button);
    QCOMPARE(toggled.count(), 3);
    moved.clear();
    QTest::mousePress(&bar, Qt::LeftButton, {}, button);
    QTest::mouseMove(&bar, button + QPoint(0, 30));
    QTest::mouseRelease(&bar, Qt::LeftButton, {}, button + QPoint(0, 30));
    QCOMPARE(toggled.count(), 3);
    QCOMPARE(moved.count(), 0);
}

RK_TEST_MAIN(TestRkDividerBar)
#include "tst_rkdividerbar.moc"
