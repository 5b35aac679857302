#include "app/rkapp.h"
#include "properties/rkfloatproperty.h"
#include "properties/rkintproperty.h"
#include "rktestmain.h"
#include "undo/rkundostack.h"
#include "undo/rkundostackhold.h"

#include <QSignalSpy>

#include <limits>

class TestRkProperty : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void nonNumbersNeverEnterAProperty();
    void clampingAppliesToAdjustValueOnly();
    void cancelEditPutsBackTheStartValue();
    void flagsSetEachFlag();
};

void TestRkProperty::nonNumbersNeverEnterAProperty()
{
    RkFloatProperty a(QStringLiteral("a"), QStringLiteral("A"));
    QSignalSpy logged(rkApp, &RkApp::logged);
    a.setValue(0.5f);
    QSignalSpy changed(&a, &RkProperty::currentValueChanged);
    RkUndoStackHold hold;
    QVERIFY(!a.setValue(std::numeric_limits<float>::quiet_NaN()));
    QVERIFY(!a.adjustValue(std::numeric_limits<float>::infinity()));
    QVERIFY(!a.setValueVariant(QVariant(-std::numeric_limits<float>::infinity())));
    QVERIFY(!a.setValueVariant(QVariant(QStringLiteral("half"))));
    QCOMPARE(a.getValue(), 0.5f);
    QCOMPARE(changed.count(), 0);
    // Logged once per property, naming it.
    QCOMPARE(logged.count(), 1);
    QVERIFY(logged.at(0).at(0).toString().contains(QStringLiteral("\"a\"")));
    hold.accept(QStringLiteral("Nothing"));
    QCOMPARE(rkUndoStack->count(), 0);
}

void TestRkProperty::clampingAppliesToAdjustValueOnly()
{
    RkFloatProperty f(QStringLiteral("f"), QStringLiteral("F"));
    f.setMinMax(0, 1);
    f.adjustValue(1.5f);
    QCOMPARE(f.getValue(), 1.5f);
    f.setClamped(true);
    f.adjustValue(1.5f);
    QCOMPARE(f.getValue(), 1.0f);
    f.setValue(1.5f);
    QCOMPARE(f.getValue(), 1.5f);

    RkIntProperty i(QStringLiteral("level"), QStringLiteral("Level"));
    i.setMinMax(0, 3);
    i.setClamped(true);
    i.adjustValue(7);
    QCOMPARE(i.getValue(), 3);
    i.adjustValue(-2);
    QCOMPARE(i.getValue(), 0);
    i.setValue(7);
    QCOMPARE(i.getValue(), 7);
}

void TestRkProperty::cancelEditPutsBackTheStartValue()
{
    RkIntProperty p(QStringLiteral("level"), QStringLiteral("Level"));
    p.setValue(1);
    p.beginEdit();
    QVERIFY(p.isEditing());
    p.setValue(2);
    p.setValue(3);
    p.cancelEdit();
    QVERIFY(!p.isEditing());
    QCOMPARE(p.getValue(), 1);

    // A finished edit keeps its value; a later cancel has nothing to put back.
    p.beginEdit();
    p.setValue(4);
    p.finishEdit();
    p.cancelEdit();
    QCOMPARE(p.getValue(), 4);
}

void TestRkProperty::flagsSetEachFlag()
{
    RkIntProperty p(QStringLiteral("level"), QStringLiteral("Level"));
    QSignalSpy changed(&p, &RkProperty::flagsChanged);
    p.setFlags(RkProperty::Hidden | RkProperty::GlobalFavorite);
    QVERIFY(p.isHidden());
    QVERIFY(!p.isFavorite());
    QVERIFY(p.isGlobalFavorite());
    QCOMPARE(changed.count(), 2);
    p.setIsFavorite(true);
    p.setHidden(false);
    QCOMPARE(p.getFlags(), RkProperty::Favorite | RkProperty::GlobalFavorite);
    // Setting the same flags again announces nothing.
    p.setFlags(p.getFlags());
    QCOMPARE(changed.count(), 4);
}

RK_TEST_MAIN(TestRkProperty)
#include "tst_rkproperty.moc"
