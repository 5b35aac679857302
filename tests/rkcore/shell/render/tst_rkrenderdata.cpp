#include "render/rkrenderdata.h"

#include <QtTest>

class TestRkRenderData : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void copyToImage_data();
    void copyToImage();
};

void TestRkRenderData::copyToImage_data()
{
    QTest::addColumn<QImage>("target");
    QTest::addColumn<QPoint>("at");
    QTest::addColumn<bool>("ok");
    QTest::addColumn<int>("redPixels");

    QImage argb(8, 8, QImage::Format_ARGB32);
    argb.fill(0);
    QImage rgb(8, 8, QImage::Format_RGB32);
    rgb.fill(Qt::black);
    QImage indexed(8, 8, QImage::Format_Indexed8);
    indexed.setColorCount(2);
    indexed.fill(0);

    QTest::newRow("inside") << argb << QPoint(2, 2) << true << 16;
    QTest::newRow("other format") << rgb << QPoint(0, 0) << true << 16;
    QTest::newRow("clipped at the edge") << argb << QPoint(6, 7) << true << 2;
    QTest::newRow("clipped before the start") << argb << QPoint(-3, -3) << true << 1;
    QTest::newRow("wholly outside") << argb << QPoint(8, 0) << false << 0;
    QTest::newRow("null target") << QImage() << QPoint(0, 0) << false << 0;
    QTest::newRow("indexed target") << indexed << QPoint(0, 0) << false << 0;
}

void TestRkRenderData::copyToImage()
{
    QFETCH(QImage, target);
    QFETCH(QPoint, at);
    QFETCH(bool, ok);
    QFETCH(int, redPixels);

    // A 4x4 frame of half-transparent red: the copy keeps the alpha instead of blending.
    QImage pixels(4, 4, QImage::Format_ARGB32);
    pixels.fill(qRgba(255, 0, 0, 128));
    const RkRenderData data(pixels, 0);
    QCOMPARE(data.copyToImage(target, at.x(), at.y()), ok);
    int red = 0;
    for (int y = 0; y < target.height(); ++y) {
        for (int x = 0; x < target.width(); ++x) {
            const QRgb p = target.pixel(x, y);
            if (qRed(p) > 100 && qGreen(p) == 0) {
                ++red;
                if (target.format() == QImage::Format_ARGB32)
                    QCOMPARE(qAlpha(p), 128);
            }
        }
    }
    QCOMPARE(red, redPixels);

    // An empty frame copies nothing.
    QImage any(4, 4, QImage::Format_ARGB32);
    QVERIFY(!RkRenderData(QImage(), 0).copyToImage(any, 0, 0));
}

QTEST_MAIN(TestRkRenderData)
#include "tst_rkrenderdata.moc"
