#include "app/rkstyle.h"
#include "rktestmain.h"

#include <QImage>
#include <QPushButton>

class TestRkStyle : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void installedApplicationWide();
    void customMetrics_data();
    void customMetrics();
    void customIcons();
};

void TestRkStyle::installedApplicationWide()
{
    QVERIFY(qobject_cast<RkStyle*>(QApplication::style()));
    QPushButton button;
    QCOMPARE(button.style()->pixelMetric(QStyle::PM_CustomBase), 4);
    RkStyle::install(); // already installed: stays
    QVERIFY(qobject_cast<RkStyle*>(QApplication::style()));
}

void TestRkStyle::customMetrics_data()
{
    QTest::addColumn<int>("offset");
    QTest::addColumn<int>("minimum");
    QTest::addColumn<int>("maximum");
    QTest::newRow("spacing") << 0 << 2 << 8;
    QTest::newRow("slider") << 9 << 12 << 30;
    QTest::newRow("row") << 10 << 16 << 32;
    QTest::newRow("divider") << 17 << 4 << 16;
    QTest::newRow("view tool bar") << 42 << 16 << 32;
    QTest::newRow("menu button extra") << 62 << 8 << 32;
    QTest::newRow("list frame") << 64 << 0 << 2;
    QTest::newRow("unused") << 5 << 0 << 0;
}

void TestRkStyle::customMetrics()
{
    QFETCH(int, offset);
    QFETCH(int, minimum);
    QFETCH(int, maximum);
    const int value = QApplication::style()->pixelMetric(RkStyle::customMetric(offset));
    QVERIFY2(value >= minimum && value <= maximum, qPrintable(QString::number(value)));
    // A combo-box row holds a line of the UI font.
    if (offset == 10)
        QVERIFY(value >= QFontMetrics(QApplication::font()).height());
}

void TestRkStyle::customIcons()
{
    // Every custom icon is drawn, and no two look alike.
    const int offsets[] = {21, 48, 49, 124, 125, 126};
    QList<QImage> images;
    for (int offset : offsets) {
        const QIcon icon = RkStyle::icon(RkStyle::customPixmap(offset));
        QVERIFY2(!icon.isNull(), qPrintable(QString::number(offset)));
        QImage image = icon.pixmap(16, 16).toImage();
        bool inked = false;
        for (int y = 0; y < image.height() && !inked; ++y) {
            for (int x = 0; x < image.width() && !inked; ++x)
                inked = qAlpha(image.pixel(x, y)) > 0;
        }
        QVERIFY2(inked, qPrintable(QString::number(offset)));
        for (const QImage& other : images)
            QVERIFY(other != image);
        images.append(image);
        QVERIFY(!QApplication::style()->standardPixmap(RkStyle::customPixmap(offset)).isNull());
    }
    QVERIFY(RkStyle::icon(RkStyle::customPixmap(7)).isNull());
    // Ordinary standard icons still come from the base style.
    QVERIFY(!RkStyle::icon(QStyle::SP_DialogOkButton).isNull() ||
            !RkStyle::icon(QStyle::SP_TitleBarCloseButton).isNull());
}

RK_TEST_MAIN(TestRkStyle)
#include "tst_rkstyle.moc"
