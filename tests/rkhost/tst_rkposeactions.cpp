#include "actions/rkaction.h"
#include "actions/rkactionmgr.h"
#include "demo/rkdemoscene.h"
#include "import/rkimporter.h"
#include "properties/rkfloatproperty.h"
#include "rkposeactions.h"
#include "rkposeedit.h"
#include "rksymmetry.h"
#include "rktestmain.h"
#include "scene/rkbone.h"
#include "scene/rkobject.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostack.h"

#include <QRadioButton>
#include <QTimer>

class TestRkPoseActions : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init();
    void cleanup();
    void everyActionIsListed();
    void actionChangesItsScopeInOneEntry_data();
    void actionChangesItsScopeInOneEntry();
    void memorizeRestoreRoundTrip();
    void lockMakesSetValueRefuse();
    void symmetryPairsAndMirrors();
    void moveToFloor_data();
    void moveToFloor();
    void zeroPoseReachesImportedBones();

private:
    RkAction* action(const char* className)
    {
        return window->getActionMgr()->findAction(className);
    }
    RkProperty* property(const QString& path) const;
    int undoCount() const { return rkUndoStack->index(); }

    std::unique_ptr<RkMainWindow> window;
    RkSkeleton* figure = nullptr;
};

namespace
{

RkFloatProperty* asFloat(RkProperty* property)
{
    return qobject_cast<RkFloatProperty*>(property);
}

// What a row of the action table looks at on a property.
double reading(RkProperty* property, const QString& what)
{
    if (what == QLatin1String("locked"))
        return property->isLocked();
    auto* f = asFloat(property);
    if (what == QLatin1String("clamped"))
        return f->isClamped();
    return what == QLatin1String("memorized") ? f->getMemorizedValue() : f->getValue();
}

QVector3D centroid(const RkNode* node)
{
    QVector<RkVec3> vertices;
    node->getObject()->getDeformedVertices(vertices);
    QVector3D sum;
    for (const RkVec3& v : vertices)
        sum += QVector3D(v.x, v.y, v.z);
    return sum / float(vertices.size());
}

} // namespace

RkProperty* TestRkPoseActions::property(const QString& path) const
{
    const QStringList parts = path.split(QLatin1Char('/'));
    RkNode* node = rkScene->findNode(parts.at(0));
    return node ? node->findProperty(parts.at(1)) : nullptr;
}

void TestRkPoseActions::init()
{
    rkScene->clear();
    rkUndoStack->clear();
    window = rkMakeTestMainWindow();
    figure = rkBuildDemoScene(rkScene);
    rkAddPoseActions(window.get());
}

void TestRkPoseActions::cleanup()
{
    window.reset();
}

void TestRkPoseActions::everyActionIsListed()
{
    const char* const names[] = {
        "RkMemorizeFigureAction",
        "RkMemorizeFigurePoseAction",
        "RkMemorizeFigureMorphsAction",
        "RkMemorizeSelectedItemsAction",
        "RkMemorizeTransformsAction",
        "RkRestoreFigureAction",
        "RkRestoreFigurePoseAction",
        "RkRestoreFigureMorphsAction",
        "RkRestoreSelectedItemsAction",
        "RkRestoreTransformsAction",
        "RkZeroFigureAction",
        "RkZeroFigurePoseAction",
        "RkZeroFigureMorphsAction",
        "RkZeroSelectedItemsAction",
        "RkZeroTransformsAction",
        "RkClearKeysFigureAction",
        "RkClearKeysFigurePoseAction",
        "RkClearKeysFigureMorphsAction",
        "RkClearKeysSelectedItemsAction",
        "RkClearKeysTransformsAction",
        "RkLimitsOnAction",
        "RkLimitsOffAction",
        "RkLockNodeAction",
        "RkUnlockNodeAction",
        "RkLockMorphsAction",
        "RkUnlockMorphsAction",
        "RkLockTransformsAction",
        "RkUnlockTransformsAction",
        "RkSymmetryAction",
        "RkMoveToFloorAction",
    };
    rkScene->selectNode(rkScene->findNode("lShldr"));
    QSet<QString> texts;
    for (const char* name : names) {
        RkAction* a = action(name);
        QVERIFY2(a, name);
        QVERIFY2(a->getDefaultMenuPath().startsWith("&Figure"), name);
        QVERIFY2(!a->statusTip().isEmpty(), name);
        texts.insert(a->text());
        // Nothing to clear: the host has no animation keys.
        QCOMPARE(a->isEnabled(), !QByteArray(name).startsWith("RkClearKeys"));
    }
    QCOMPARE(texts.size(), int(std::size(names)));
    // Figure commands follow the selection.
    rkScene->clearSelection();
    QVERIFY(!action("RkZeroFigurePoseAction")->isEnabled());
    rkScene->selectNode(rkScene->findNode(RkDemoPropName));
    QVERIFY(!action("RkZeroFigurePoseAction")->isEnabled());
    QVERIFY(action("RkZeroTransformsAction")->isEnabled());
}

void TestRkPoseActions::actionChangesItsScopeInOneEntry_data()
{
    QTest::addColumn<QString>("className");
    QTest::addColumn<QString>("caption");
    QTest::addColumn<QString>("select");
    QTest::addColumn<QString>("what");
    QTest::addColumn<QString>("touched");
    QTest::addColumn<QString>("untouched");
    QTest::addColumn<double>("start");
    QTest::addColumn<double>("expected");

    // Every numeric property starts at 0.5 with 0.25 memorized; "start" overrides the value, or
    // the flag read.
    auto row = [](const char* className, const char* caption, const char* select, const char* what,
                  const char* touched, const char* untouched, double start, double expected) {
        QTest::newRow(className) << className << caption << select << what << touched << untouched
                                 << start << expected;
    };
    row("RkMemorizeFigureAction", "Memorize Figure", "lShldr", "memorized", "Figure/Smile",
        "Prop/XTranslate", 0.5, 0.5);
    row("RkMemorizeFigurePoseAction", "Memorize Figure Pose", "Figure", "memorized",
        "rHand/ZRotate", "Figure/Smile", 0.5, 0.5);
    row("RkMemorizeFigureMorphsAction", "Memorize Figure Morphs", "hip", "memorized",
        "Figure/Smile", "hip/ZRotate", 0.5, 0.5);
    row("RkMemorizeSelectedItemsAction", "Memorize Selected Items", "Prop", "memorized",
        "Prop/XTranslate", "Figure/Smile", 0.5, 0.5);
    row("RkMemorizeTransformsAction", "Memorize Transforms", "Figure", "memorized",
        "Figure/XRotate", "Figure/Smile", 0.5, 0.5);
    row("RkRestoreFigureAction", "Restore Figure", "rFoot", "value", "lHand/XRotate",
        "Prop/XRotate", 0.5, 0.25);
    row("RkRestoreFigurePoseAction", "Restore Figure Pose", "head", "value", "lShin/YRotate",
        "Figure/Smile", 0.5, 0.25);
    row("RkRestoreFigureMorphsAction", "Restore Figure Morphs", "Figure", "value", "Figure/JawOpen",
        "Figure/XRotate", 0.5, 0.25);
    row("RkRestoreSelectedItemsAction", "Restore Selected Items", "Figure", "value", "Figure/Smile",
        "hip/XRotate", 0.5, 0.25);
    row("RkRestoreTransformsAction", "Restore Transforms", "Prop", "value", "Prop/ZTranslate",
        "Figure/ZTranslate", 0.5, 0.25);
    row("RkZeroFigureAction", "Zero Figure", "neck", "value", "Figure/BodyHeavy", "Prop/YRotate",
        0.5, 0);
    row("RkZeroFigurePoseAction", "Zero Figure Pose", "Figure", "value", "rForeArm/ZRotate",
        "Figure/Smile", 0.5, 0);
    row("RkZeroFigureMorphsAction", "Zero Figure Morphs", "lHand", "value", "Figure/Smile",
        "lHand/XRotate", 0.5, 0);
    row("RkZeroSelectedItemsAction", "Zero Selected Items", "Prop", "value", "Prop/XRotate",
        "Figure/Smile", 0.5, 0);
    row("RkZeroTransformsAction", "Zero Transforms", "Prop", "value", "Prop/Scale", "Figure/Scale",
        0.5, 1);
    row("RkLimitsOnAction", "Limits On", "Prop", "value", "Prop/XTranslate", "Figure/XTranslate",
        2000, 1000);
    row("RkLimitsOffAction", "Limits Off", "lShldr", "clamped", "lShldr/ZRotate", "rShldr/ZRotate",
        1, 0);
    row("RkLockNodeAction", "Lock Node", "Prop", "locked", "Prop/Visible", "Figure/Visible", 0, 1);
    row("RkUnlockNodeAction", "Unlock Node", "Prop", "locked", "Prop/XRotate", "Figure/XRotate", 1,
        0);
    row("RkLockMorphsAction", "Lock Morphs", "lShldr", "locked", "Figure/Smile", "Figure/XRotate",
        0, 1);
    row("RkUnlockMorphsAction", "Unlock Morphs", "lShldr", "locked", "Figure/Smile",
        "lShldr/XRotate", 1, 0);
    row("RkLockTransformsAction", "Lock Transforms", "lShldr", "locked", "lShldr/YRotate",
        "Figure/Smile", 0, 1);
    row("RkUnlockTransformsAction", "Unlock Transforms", "lShldr", "locked", "lShldr/YRotate",
        "rShldr/YRotate", 1, 0);
}

void TestRkPoseActions::actionChangesItsScopeInOneEntry()
{
    QFETCH(QString, className);
    QFETCH(QString, caption);
    QFETCH(QString, select);
    QFETCH(QString, what);
    QFETCH(QString, touched);
    QFETCH(QString, untouched);
    QFETCH(double, start);
    QFETCH(double, expected);

    RkProperty* changed = property(touched);
    RkProperty* other = property(untouched);
    QVERIFY(changed && other);
    for (RkProperty* p : {changed, other}) {
        if (auto* f = asFloat(p)) {
            f->setValue(what == QLatin1String("value") ? float(start) : 0.5f);
            f->setMemorizedValue(0.25f);
        }
        if (what == QLatin1String("clamped"))
            asFloat(p)->setClamped(start != 0);
        if (what == QLatin1String("locked"))
            p->setLocked(start != 0);
    }
    rkScene->selectNode(rkScene->findNode(select));
    const int before = undoCount();

    action(qPrintable(className))->trigger();
    QCOMPARE(undoCount(), before + 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), caption);
    QCOMPARE(reading(changed, what), expected);
    QCOMPARE(reading(other, what), what == QLatin1String("memorized") ? 0.25 : start);

    rkUndoStack->undo();
    QCOMPARE(reading(changed, what), what == QLatin1String("memorized") ? 0.25 : start);
    rkUndoStack->redo();
    QCOMPARE(reading(changed, what), expected);
}

void TestRkPoseActions::memorizeRestoreRoundTrip()
{
    rkScene->selectNode(figure);
    auto* bend = figure->findBone("lForeArm")->getZRotate();
    auto* smile = asFloat(figure->findProperty("Smile"));
    bend->setValue(40);
    smile->setValue(0.7f);
    action("RkMemorizeFigureAction")->trigger();
    action("RkZeroFigureAction")->trigger();
    QCOMPARE(bend->getValue(), 0.0f);
    QCOMPARE(smile->getValue(), 0.0f);
    // Nothing left to zero: no entry.
    const int entries = undoCount();
    action("RkZeroFigureAction")->trigger();
    QCOMPARE(undoCount(), entries);
    action("RkRestoreFigureAction")->trigger();
    QCOMPARE(bend->getValue(), 40.0f);
    QCOMPARE(smile->getValue(), 0.7f);
    // Undoing the memorize brings back the value memorized before it (the default).
    rkUndoStack->undo();
    rkUndoStack->undo();
    rkUndoStack->undo();
    QCOMPARE(rkUndoStack->getUndoCaption(), QString());
    QCOMPARE(bend->getMemorizedValue(), 0.0f);
    QCOMPARE(smile->getMemorizedValue(), 0.0f);
}

void TestRkPoseActions::lockMakesSetValueRefuse()
{
    RkNode* prop = rkScene->findNode(RkDemoPropName);
    rkScene->selectNode(prop);
    action("RkLockTransformsAction")->trigger();
    QVERIFY(!prop->getXTranslate()->setValue(0.3f));
    QCOMPARE(prop->getXTranslate()->getValue(), 0.0f);
    // Zero and Restore go through the same setters, so locked values stay.
    prop->getXRotate()->setValueVariant(30.0f);
    const int entries = undoCount();
    action("RkZeroTransformsAction")->trigger();
    QCOMPARE(prop->getXRotate()->getValue(), 30.0f);
    QCOMPARE(undoCount(), entries);

    rkScene->selectNode(figure);
    action("RkLockMorphsAction")->trigger();
    QVERIFY(!asFloat(figure->findProperty("Smile"))->setValue(0.5f));
    QVERIFY(figure->getXRotate()->setValue(10));
    action("RkUnlockMorphsAction")->trigger();
    QVERIFY(asFloat(figure->findProperty("Smile"))->setValue(0.5f));

    rkScene->selectNode(prop);
    action("RkUnlockTransformsAction")->trigger();
    QVERIFY(prop->getXTranslate()->setValue(0.3f));
}

void TestRkPoseActions::symmetryPairsAndMirrors()
{
    QCOMPARE(RkSymmetry::partnerName("lShldr"), QStringLiteral("rShldr"));
    QCOMPARE(RkSymmetry::partnerName("rFoot"), QStringLiteral("lFoot"));
    QCOMPARE(RkSymmetry::partnerName("LeftHand"), QStringLiteral("RightHand"));
    QCOMPARE(RkSymmetry::partnerName("leg"), QString());
    QCOMPARE(RkSymmetry::partnerName("hip"), QString());
    const QList<RkSymmetry::Pair> pairs = RkSymmetry::pairs(figure);
    QCOMPARE(pairs.size(), 7);
    for (const RkSymmetry::Pair& pair : pairs)
        QCOMPARE(RkSymmetry::partnerName(pair.left->getName()), pair.right->getName());

    RkNode* left = figure->findBone("lShldr");
    RkNode* right = figure->findBone("rShldr");
    left->getXRotate()->setValue(10);
    left->getYRotate()->setValue(20);
    left->getZRotate()->setValue(-50);
    figure->findBone("lForeArm")->getYRotate()->setValue(60);
    const int entries = undoCount();
    QVERIFY(RkSymmetry::mirror(figure, RkSymmetry::Direction::LeftToRight, "Symmetry"));
    QCOMPARE(undoCount(), entries + 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Symmetry"));
    QCOMPARE(right->getXRotate()->getValue(), 10.0f);
    QCOMPARE(right->getYRotate()->getValue(), -20.0f);
    QCOMPARE(right->getZRotate()->getValue(), 50.0f);
    // The mirrored arm is the left one reflected in the figure's YZ plane.
    for (const char* bone : {"Shldr", "ForeArm", "Hand"}) {
        const QVector3D l = centroid(figure->findBone(QStringLiteral("l") + bone));
        const QVector3D r = centroid(figure->findBone(QStringLiteral("r") + bone));
        QVERIFY2((QVector3D(-l.x(), l.y(), l.z()) - r).length() < 1e-4f, bone);
    }
    rkUndoStack->undo();
    QCOMPARE(right->getZRotate()->getValue(), 0.0f);

    figure->findBone("rThigh")->getXRotate()->setValue(-30);
    figure->findBone("rThigh")->getZRotate()->setValue(15);
    QVERIFY(RkSymmetry::mirror(figure, RkSymmetry::Direction::RightToLeft, "Symmetry"));
    QCOMPARE(figure->findBone("lThigh")->getXRotate()->getValue(), -30.0f);
    QCOMPARE(figure->findBone("lThigh")->getZRotate()->getValue(), -15.0f);
    // The left arm was overwritten by the unposed right one.
    QCOMPARE(left->getZRotate()->getValue(), 0.0f);

    // The action asks for the direction first.
    figure->findBone("rHand")->getZRotate()->setValue(25);
    rkScene->selectNode(figure->findBone("head"));
    const int beforeAction = undoCount();
    QTimer::singleShot(0, this, [] {
        if (QWidget* dialog = QApplication::activeModalWidget()) {
            const auto buttons = dialog->findChildren<QRadioButton*>();
            if (buttons.size() == 2)
                buttons.at(1)->click();
            QTest::keyClick(dialog, Qt::Key_Return);
        }
    });
    action("RkSymmetryAction")->trigger();
    QCOMPARE(undoCount(), beforeAction + 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Symmetry"));
    QCOMPARE(figure->findBone("lHand")->getZRotate()->getValue(), -25.0f);
}

void TestRkPoseActions::moveToFloor_data()
{
    QTest::addColumn<QString>("node");
    QTest::addColumn<QString>("bent");
    QTest::addColumn<float>("bend");
    QTest::addColumn<float>("shift");

    QTest::newRow("raised prop") << "Prop"
                                 << "Prop/XRotate" << 30.0f << 0.7f;
    QTest::newRow("lowered figure, leg bent") << "Figure"
                                              << "lThigh/XRotate" << -60.0f << -0.2f;
    // The hand's translation works in its turned forearm's frame.
    QTest::newRow("hand of a turned arm") << "lHand"
                                          << "lForeArm/ZRotate" << -60.0f << 0.1f;
}

void TestRkPoseActions::moveToFloor()
{
    QFETCH(QString, node);
    QFETCH(QString, bent);
    QFETCH(float, bend);
    QFETCH(float, shift);
    RkNode* target = rkScene->findNode(node);
    asFloat(property(bent))->setValue(bend);
    target->getYTranslate()->setValue(shift);
    rkScene->selectNode(target);
    float lowest = 0;
    QVERIFY(RkPoseEdit::lowestPoint(target, lowest));
    QVERIFY(std::abs(lowest) > 0.05f);

    action("RkMoveToFloorAction")->trigger();
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Move to Floor"));
    QVERIFY(RkPoseEdit::lowestPoint(target, lowest));
    QVERIFY2(std::abs(lowest) < 1e-4f, qPrintable(QString::number(lowest)));
    rkUndoStack->undo();
    QCOMPARE(target->getYTranslate()->getValue(), shift);
}

void TestRkPoseActions::zeroPoseReachesImportedBones()
{
    const QString model =
        QStringLiteral("/usr/share/assimp/models/glTF2/simple_skin/simple_skin.gltf");
    if (!QFile::exists(model))
        QSKIP("Debian's assimp-testmodels is not installed (scripts/setup.sh installs it)");
    RkImporter importer;
    QVERIFY(importer.read(model));
    auto* imported = qobject_cast<RkSkeleton*>(importer.addToScene(rkScene));
    QVERIFY(imported);
    QList<RkBone*> bones;
    imported->getAllBones(bones);
    QVERIFY(bones.size() >= 2);
    RkBone* bone = bones.last();
    QCOMPARE(bone->getZRotate()->getPath(), QStringLiteral("Pose"));
    bone->getZRotate()->setValue(35.0f);
    bone->getYTranslate()->setValue(0.2f);
    RkFloatProperty* demoTurn = figure->findBone(QStringLiteral("lShldr"))->getZRotate();
    demoTurn->setValue(20.0f);
    rkScene->selectNode(imported);
    action("RkZeroFigurePoseAction")->trigger();
    QCOMPARE(bone->getZRotate()->getValue(), 0.0f);
    QCOMPARE(bone->getYTranslate()->getValue(), 0.0f);
    // The demo figure was not selected and keeps its pose.
    QCOMPARE(demoTurn->getValue(), 20.0f);
}

RK_TEST_MAIN(TestRkPoseActions)
#include "tst_rkposeactions.moc"
