#include "rktestmain.h"
#include "rktsimplearray.h"

namespace
{
QStringList warnings;

void collect(QtMsgType type, const QMessageLogContext&, const QString& message)
{
    if (type == QtWarningMsg)
        warnings.append(message);
}

// Collects the warnings given while it lives.
struct WarningCatcher {
    WarningCatcher() : previous(qInstallMessageHandler(collect)) { warnings.clear(); }
    ~WarningCatcher() { qInstallMessageHandler(previous); }
    QtMessageHandler previous;
};
} // namespace

class TestRkTSimpleArray : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void growsByBlocks();
    void removes();
    void indexing();
};

void TestRkTSimpleArray::growsByBlocks()
{
    {
        WarningCatcher catcher;
        RkTSimpleArray<int> one(0);
        QCOMPARE(warnings.size(), 1);
        QVERIFY(warnings.at(0).endsWith(
            "Invalid block grow size specified in RkTSimpleArray::RkTSimpleArray()"));
        for (int i = 0; i < 3; ++i) {
            QVERIFY(one.append(i));
            QCOMPARE(one.capacity(), i + 1);
        }
    }
    RkTSimpleArray<int> array(16);
    for (int i = 0; i < 16; ++i)
        array.append(i * 10);
    QCOMPARE(array.capacity(), 16);
    array.append(160);
    QCOMPARE(array.capacity(), 32);
    for (int i = 0; i < 17; ++i)
        QCOMPARE(array[i], i * 10);
    QCOMPARE(array.indexOf(50), 5);
    QCOMPARE(array.indexOf(55), -1);

    // Cleared storage is reused.
    const int* storage = array.data();
    array.clear();
    for (int i = 0; i < 32; ++i)
        array.append(i);
    QCOMPARE(array.data(), storage);
    QCOMPARE(array.capacity(), 32);

    // Growing without keeping the contents leaves nothing to read.
    QVERIFY(array.grow(8, false));
    QCOMPARE(array.capacity(), 40);
    QCOMPARE(array.count(), 0);
    QCOMPARE(array.indexOf(0), -1);
}

void TestRkTSimpleArray::removes()
{
    RkTSimpleArray<int> array(4);
    for (int i = 0; i < 10; ++i)
        array.append(i);
    WarningCatcher catcher;
    array.removeByIndex(8, 5);
    QCOMPARE(array.count(), 8);
    QVERIFY(warnings.last().endsWith(
        "Too many items specified for remove in RkTSimpleArray::removeByIndex()"));
    array.removeByIndex(8, 1);
    QCOMPARE(array.count(), 8);
    QVERIFY(warnings.last().endsWith("Index out of range in RkTSimpleArray::removeByIndex()"));
    QCOMPARE(warnings.size(), 2);
    // A negative count would move elements from behind the array's end.
    array.removeByIndex(2, -3);
    QCOMPARE(array.count(), 8);
    QCOMPARE(warnings.size(), 3);
    QVERIFY(
        warnings.last().endsWith("Negative count specified in RkTSimpleArray::removeByIndex()"));

    array.removeByIndex(2, 3); // 0 1 5 6 7
    QCOMPARE(array.count(), 5);
    QCOMPARE(array[2], 5);
    QCOMPARE(array[4], 7);
    QVERIFY(array.removeValue(6));
    QVERIFY(!array.removeValue(6));
    QCOMPARE(array.count(), 4);
    QCOMPARE(array[3], 7);
    QCOMPARE(array.capacity(), 12);
}

void TestRkTSimpleArray::indexing()
{
    RkTSimpleArray<int> array(2);
    bool thrown = false;
    try {
        array[0];
    } catch (const char* message) {
        thrown = QByteArray(message) == "Illegal array index in RkTSimpleArray::operator[]";
    }
    QVERIFY(thrown);

    array.append(7);
    array.append(8);
    WarningCatcher catcher;
    QCOMPARE(array[3], 7);
    QCOMPARE(array[-1], 7);
    QCOMPARE(warnings.size(), 2);
    QVERIFY(warnings.at(0).endsWith("Illegal array index in RkTSimpleArray::operator[]"));
}

RK_TEST_MAIN(TestRkTSimpleArray)
#include "tst_rktsimplearray.moc"
