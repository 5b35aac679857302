#include "rkezmixerreference.h"
#include "rkezmixersolver.h"

#include <QRandomGenerator>
#include <QtTest>

#include <cmath>

namespace
{

// Distinct scattered points on a mixer field of 210 by 254 pixels.
QVector<QPoint> scatter(QRandomGenerator& random, int count)
{
    QVector<QPoint> points;
    while (points.size() < count) {
        const QPoint p(random.bounded(210), random.bounded(254));
        if (!points.contains(p))
            points.append(p);
    }
    return points;
}

QPoint anywhere(QRandomGenerator& random)
{
    return QPoint(15 + random.bounded(180), 15 + random.bounded(224));
}

} // namespace

class TestRkEzMixerSolver : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void twoControls_data();
    void twoControls();
    void layout_data();
    void layout();
    void controlPointsGiveUnitWeights();
    void fastPathAgreesWithReference();
    void singularSystemsGiveNoWeights_data();
    void singularSystemsGiveNoWeights();
};

void TestRkEzMixerSolver::twoControls_data()
{
    QTest::addColumn<QPoint>("driver");
    QTest::addColumn<float>("weight0");

    // Controls at (40, 100) and (140, 100): only the driver's projection on their line counts,
    // and past either end the weights run on linearly, unclamped.
    QTest::newRow("on control 0") << QPoint(40, 100) << 1.f;
    QTest::newRow("on control 1") << QPoint(140, 100) << 0.f;
    QTest::newRow("halfway") << QPoint(90, 100) << 0.5f;
    QTest::newRow("quarter, off the line") << QPoint(65, 180) << 0.75f;
    QTest::newRow("beyond control 1") << QPoint(190, 100) << -0.5f;
}

void TestRkEzMixerSolver::twoControls()
{
    QFETCH(QPoint, driver);
    QFETCH(float, weight0);

    RkEzMixerSolver solver({QPoint(40, 100), QPoint(140, 100)});
    QVector<float> fast, reference;
    QVERIFY(solver.weights(driver, fast));
    QVERIFY(rkEzMixerReferenceWeights(solver, driver, reference));
    for (const QVector<float>& w : {fast, reference}) {
        QCOMPARE(w.size(), 2);
        QVERIFY2(std::fabs(w[0] - weight0) < 1e-5f && std::fabs(w[1] - (1.f - weight0)) < 1e-5f,
                 qPrintable(QString("%1, %2").arg(w[0]).arg(w[1])));
    }
}

void TestRkEzMixerSolver::layout_data()
{
    QTest::addColumn<QVector<QPoint>>("points");
    QTest::addColumn<int>("layout");
    QTest::addColumn<int>("size");

    QTest::newRow("one") << QVector<QPoint>{{105, 42}} << int(RkEzMixerSolver::None) << 0;
    QTest::newRow("two") << QVector<QPoint>{{105, 42}, {168, 127}} << int(RkEzMixerSolver::Line)
                         << 4;
    QTest::newRow("three on a line")
        << QVector<QPoint>{{10, 10}, {50, 30}, {110, 60}} << int(RkEzMixerSolver::Line) << 5;
    QTest::newRow("three about on a line, one behind")
        << QVector<QPoint>{{50, 10}, {150, 10}, {0, 20}} << int(RkEzMixerSolver::Line) << 5;
    QTest::newRow("triangle") << QVector<QPoint>{{105, 42}, {168, 127}, {105, 212}}
                              << int(RkEzMixerSolver::Plane) << 6;
    // A point on the first one has no direction and counts as off the line.
    QTest::newRow("point on the first one")
        << QVector<QPoint>{{10, 10}, {50, 10}, {10, 10}} << int(RkEzMixerSolver::Plane) << 6;
}

void TestRkEzMixerSolver::layout()
{
    QFETCH(QVector<QPoint>, points);
    QFETCH(int, layout);
    QFETCH(int, size);

    RkEzMixerSolver solver(points);
    QCOMPARE(int(solver.layout()), layout);
    QCOMPARE(solver.systemSize(), size);
    QVector<float> w{42.f};
    if (layout == RkEzMixerSolver::None) {
        QVERIFY(!solver.weights(points[0], w));
        QCOMPARE(w, QVector<float>{42.f});
    }
}

void TestRkEzMixerSolver::controlPointsGiveUnitWeights()
{
    QRandomGenerator random(7);
    for (int n = 3; n <= 8; ++n) {
        for (int round = 0; round < 20; ++round) {
            const QVector<QPoint> points = scatter(random, n);
            RkEzMixerSolver solver(points);
            for (int k = 0; k < n; ++k) {
                QVector<float> fast, reference;
                QVERIFY(solver.weights(points[k], fast));
                QVERIFY(rkEzMixerReferenceWeights(solver, points[k], reference));
                for (int i = 0; i < n; ++i) {
                    const float expected = i == k ? 1.f : 0.f;
                    QVERIFY2(std::fabs(fast[i] - expected) < 1e-4f &&
                                 std::fabs(reference[i] - expected) < 1e-4f,
                             qPrintable(QString("%1 controls, on %2: weight %3 is %4 / %5")
                                            .arg(n)
                                            .arg(k)
                                            .arg(i)
                                            .arg(fast[i])
                                            .arg(reference[i])));
                }
            }
        }
    }
}

// The reference sums K products in single precision, some around ten (the linear terms take
// the driver's absolute coordinates), so its own rounding grows with the number of controls;
// from about 32 controls on it alone passes 1e-5 (up to 2e-5 at 48 and 64).
void TestRkEzMixerSolver::fastPathAgreesWithReference()
{
    QRandomGenerator random(3);
    for (int n : {2, 3, 4, 6, 8, 12, 16, 24, 32, 48, 64}) {
        float worst = 0.f;
        for (int round = 0; round < 50; ++round) {
            RkEzMixerSolver solver(scatter(random, n));
            const QPoint driver = anywhere(random);
            QVector<float> fast, reference;
            QVERIFY(solver.weights(driver, fast));
            QVERIFY(rkEzMixerReferenceWeights(solver, driver, reference));
            for (int i = 0; i < n; ++i)
                worst = std::max(worst, std::fabs(fast[i] - reference[i]));
        }
        QVERIFY2(worst < (n <= 24 ? 1e-5f : 5e-5f),
                 qPrintable(QString("%1: %2").arg(n).arg(worst)));
    }
}

void TestRkEzMixerSolver::singularSystemsGiveNoWeights_data()
{
    QTest::addColumn<QVector<QPoint>>("points");

    QTest::newRow("two on one point") << QVector<QPoint>{{60, 60}, {60, 60}};
    QTest::newRow("two of four on one point")
        << QVector<QPoint>{{105, 42}, {168, 127}, {60, 187}, {168, 127}};
    QTest::newRow("on a line, two on one point")
        << QVector<QPoint>{{10, 10}, {50, 10}, {90, 10}, {50, 10}};
}

void TestRkEzMixerSolver::singularSystemsGiveNoWeights()
{
    QFETCH(QVector<QPoint>, points);

    RkEzMixerSolver solver(points);
    for (const QPoint& driver : {QPoint(105, 127), points[0]}) {
        QVector<float> w{7.f};
        QVERIFY(!solver.weights(driver, w));
        QVERIFY(!rkEzMixerReferenceWeights(solver, driver, w));
        QCOMPARE(w, QVector<float>{7.f});
    }
}

QTEST_APPLESS_MAIN(TestRkEzMixerSolver)
#include "tst_rkezmixersolver.moc"
