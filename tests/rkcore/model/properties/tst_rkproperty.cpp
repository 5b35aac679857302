#include "app/rkapp.h"
#include "properties/rkfloatproperty.h"
#include "properties/rkintproperty.h"
#include "rktestmain.h"
#include "undo/rkundostack.h"
#include "undo/rkundostackhold.h"

#include <QSignalSpy>

#include <functional>
#include <limits>

class TestRkProperty : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void nonNumbersNeverEnterAProperty();
    void clampingAppliesToAdjustValueOnly();
    void cancelEditPutsBackTheStartValue();
    void flagsSetEachFlag();
    void lockRefusesTheSettersOnly();
    void memorizedValueFollowsTheDefaultUntilSet();
    void everyShownChangeSaysChanged();
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

void TestRkProperty::lockRefusesTheSettersOnly()
{
    RkFloatProperty f(QStringLiteral("f"), QStringLiteral("Tilt"));
    RkIntProperty n(QStringLiteral("n"), QStringLiteral("Count"));
    {
        RkUndoStackHold hold;
        f.setValue(0.5f);
        hold.accept(QStringLiteral("Tilt"));
    }
    f.setLocked(true);
    n.setLocked(true);
    QVERIFY(f.getFlags() & RkProperty::Locked);
    QVERIFY(!f.setValue(0.9f));
    QVERIFY(!f.adjustValue(0.9f));
    QVERIFY(!n.setValue(3));
    QCOMPARE(f.getValue(), 0.5f);
    QCOMPARE(n.getValue(), 0);
    // History and files still reach a locked property.
    rkUndoStack->undo();
    QCOMPARE(f.getValue(), 0.0f);
    QVERIFY(f.setValueVariant(QVariant(0.25f)));
    QCOMPARE(f.getValue(), 0.25f);
    f.setFlags(0);
    QVERIFY(!f.isLocked());
    QVERIFY(f.setValue(0.75f));
}

void TestRkProperty::memorizedValueFollowsTheDefaultUntilSet()
{
    RkFloatProperty f(QStringLiteral("f"), QStringLiteral("F"));
    f.setDefaultValue(0.2f);
    QCOMPARE(f.getMemorizedValue(), 0.2f);
    f.setMemorizedValue(0.6f);
    f.setDefaultValue(0.3f);
    QCOMPARE(f.getMemorizedValue(), 0.6f);
    f.setMemorizedValue(std::numeric_limits<float>::quiet_NaN());
    QCOMPARE(f.getMemorizedValue(), 0.6f);

    RkIntProperty label(QStringLiteral("note"), false, true, 4);
    QCOMPARE(label.getLabel(), QStringLiteral("note"));
    QVERIFY(label.isHidden() && !label.isClamped());
    QCOMPARE(label.getValue(), 4);
}

// Widgets follow a property through changed() alone.
void TestRkProperty::everyShownChangeSaysChanged()
{
    RkFloatProperty f(QStringLiteral("f"), QStringLiteral("F"));
    RkIntProperty i(QStringLiteral("i"), QStringLiteral("I"));
    QSignalSpy floatChanged(&f, &RkProperty::changed);
    QSignalSpy intChanged(&i, &RkProperty::changed);
    int expected = 0;
    const auto step = [&](const std::function<void()>& change, bool says) {
        change();
        expected += says ? 1 : 0;
        QCOMPARE(floatChanged.count(), expected);
    };
    step([&] { f.setValue(0.5f); }, true);
    step([&] { f.setValue(0.5f); }, false);
    step([&] { f.setValueVariant(QVariant(0.25)); }, true);
    step([&] { f.setLabel(QStringLiteral("Bend")); }, true);
    step([&] { f.setMinMax(-1, 2); }, true);
    step([&] { f.setClamped(true); }, true);
    step([&] { f.setDisplayAsPercent(true); }, true);
    step([&] { f.setHidden(true); }, true);
    step([&] { f.setIsFavorite(true); }, true);
    step([&] { f.setIsGlobalFavorite(true); }, true);
    step([&] { f.setLocked(true); }, true);
    step([&] { f.setSelected(true); }, false);
    step([&] { f.setPath(QStringLiteral("Morphs")); }, false);

    i.setMinMax(0, 9);
    i.setClamped(true);
    i.setValue(4);
    QCOMPARE(intChanged.count(), 3);
}

RK_TEST_MAIN(TestRkProperty)
#include "tst_rkproperty.moc"
