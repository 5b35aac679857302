#include "rkcamera.h"
#include "rkfloatproperty.h"
#include "rkscene.h"
#include "rktestmain.h"
#include "rkundostack.h"
#include "rkundostackhold.h"

#include <QSignalSpy>

class TestRkUndoStack : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init();
    void acceptMakesOneEntryWithCaption();
    void cancelRestoresEverythingAndLeavesNothing();
    void undoRedoWalkTheEntries();
    void nestedHoldsFoldIntoTheOutermost();
    void changesWithoutHoldAreNotUndoable();
    void cancelTakesBackCameraFraming();
    void deletedPropertyIsSkipped();

private:
    RkNode* node = nullptr;
    RkFloatProperty* a = nullptr;
    RkFloatProperty* b = nullptr;
};

void TestRkUndoStack::init()
{
    rkScene->clear();
    node = new RkNode;
    node->setName(QStringLiteral("n"));
    a = new RkFloatProperty(QStringLiteral("a"), QStringLiteral("A"));
    b = new RkFloatProperty(QStringLiteral("b"), QStringLiteral("B"));
    node->addProperty(a, QStringLiteral("G"));
    node->addProperty(b, QStringLiteral("G"));
    rkScene->addNode(node);
    rkUndoStack->clear();
}

void TestRkUndoStack::acceptMakesOneEntryWithCaption()
{
    QSignalSpy captions(rkUndoStack, &RkUndoStack::undoCaptionChanged);
    QVERIFY(!rkUndoStack->canPushItems());
    {
        RkUndoStackHold hold;
        QVERIFY(rkUndoStack->canPushItems());
        a->setValue(1);
        a->setValue(2);
        b->setValue(3);
        hold.accept(QStringLiteral("Shape Mixing"));
    }
    QVERIFY(!rkUndoStack->canPushItems());
    QCOMPARE(rkUndoStack->count(), 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Shape Mixing"));
    QCOMPARE(captions.count(), 1);
    QCOMPARE(captions.last().at(0).toString(), QStringLiteral("Shape Mixing"));

    // A second entry with the same caption is still announced: the top changed.
    {
        RkUndoStackHold hold;
        a->setValue(5);
        hold.accept(QStringLiteral("Shape Mixing"));
    }
    QCOMPARE(rkUndoStack->count(), 2);
    QCOMPARE(captions.count(), 2);

    // A hold that changed nothing leaves no entry.
    {
        RkUndoStackHold hold;
        a->setValue(7);
        a->setValue(5);
        hold.accept(QStringLiteral("Nothing"));
    }
    QCOMPARE(rkUndoStack->count(), 2);
}

void TestRkUndoStack::cancelRestoresEverythingAndLeavesNothing()
{
    a->setValue(0.25f);
    QSignalSpy changed(a, &RkProperty::currentValueChanged);
    {
        RkUndoStackHold hold;
        a->setValue(1);
        b->setValue(2);
        a->setValue(3);
        hold.cancel();
        QVERIFY(!rkUndoStack->canPushItems());
    }
    QCOMPARE(a->getValue(), 0.25f);
    QCOMPARE(b->getValue(), 0.0f);
    QCOMPARE(rkUndoStack->count(), 0);
    QCOMPARE(changed.count(), 3);

    // A hold destroyed undecided cancels too.
    {
        RkUndoStackHold hold;
        a->setValue(9);
    }
    QCOMPARE(a->getValue(), 0.25f);
    QCOMPARE(rkUndoStack->count(), 0);
}

void TestRkUndoStack::undoRedoWalkTheEntries()
{
    QSignalSpy captions(rkUndoStack, &RkUndoStack::undoCaptionChanged);
    {
        RkUndoStackHold hold;
        a->setValue(1);
        hold.accept(QStringLiteral("First"));
    }
    {
        RkUndoStackHold hold;
        a->setValue(2);
        b->setValue(4);
        hold.accept(QStringLiteral("Second"));
    }
    rkUndoStack->undo();
    QCOMPARE(a->getValue(), 1.0f);
    QCOMPARE(b->getValue(), 0.0f);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("First"));
    QCOMPARE(rkUndoStack->getRedoCaption(), QStringLiteral("Second"));
    QCOMPARE(captions.last().at(0).toString(), QStringLiteral("First"));

    // Undo and redo are refused while a hold is open.
    {
        RkUndoStackHold hold;
        rkUndoStack->undo();
        QCOMPARE(a->getValue(), 1.0f);
        hold.cancel();
    }

    rkUndoStack->undo();
    QCOMPARE(a->getValue(), 0.0f);
    QVERIFY(!rkUndoStack->canUndo());
    QCOMPARE(rkUndoStack->getUndoCaption(), QString());
    rkUndoStack->undo(); // nothing left: no change
    QCOMPARE(a->getValue(), 0.0f);

    rkUndoStack->redo();
    rkUndoStack->redo();
    QCOMPARE(a->getValue(), 2.0f);
    QCOMPARE(b->getValue(), 4.0f);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Second"));

    // A new entry after an undo drops what could have been redone.
    rkUndoStack->undo();
    {
        RkUndoStackHold hold;
        b->setValue(8);
        hold.accept(QStringLiteral("Third"));
    }
    QVERIFY(!rkUndoStack->canRedo());
    QCOMPARE(rkUndoStack->count(), 2);
    // Undo and redo themselves are not recorded as new entries.
    rkUndoStack->undo();
    QCOMPARE(rkUndoStack->count(), 2);
    QCOMPARE(b->getValue(), 0.0f);
}

void TestRkUndoStack::nestedHoldsFoldIntoTheOutermost()
{
    {
        RkUndoStackHold outer;
        a->setValue(1);
        {
            RkUndoStackHold inner;
            QCOMPARE(rkUndoStack->holdDepth(), 2);
            b->setValue(2);
            inner.accept(QStringLiteral("Inner"));
        }
        QCOMPARE(rkUndoStack->count(), 0);
        {
            RkUndoStackHold previewed;
            a->setValue(50);
            b->setValue(60);
            previewed.cancel();
        }
        // Only the inner hold's changes went back.
        QCOMPARE(a->getValue(), 1.0f);
        QCOMPARE(b->getValue(), 2.0f);
        outer.accept(QStringLiteral("Outer"));
    }
    QCOMPARE(rkUndoStack->count(), 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Outer"));
    rkUndoStack->undo();
    QCOMPARE(a->getValue(), 0.0f);
    QCOMPARE(b->getValue(), 0.0f);

    // Cancelling the outer hold also takes back what an inner one accepted; the inner hold,
    // closed with it, can no longer act on a later hold.
    auto* outer = new RkUndoStackHold;
    auto* inner = new RkUndoStackHold;
    a->setValue(3);
    outer->cancel();
    QCOMPARE(a->getValue(), 0.0f);
    QVERIFY(!inner->isOpen());
    RkUndoStackHold later;
    a->setValue(4);
    delete inner;
    QVERIFY(later.isOpen());
    later.accept(QStringLiteral("Later"));
    delete outer;
    QCOMPARE(a->getValue(), 4.0f);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Later"));
}

void TestRkUndoStack::changesWithoutHoldAreNotUndoable()
{
    a->setValue(3);
    QCOMPARE(rkUndoStack->count(), 0);
    rkUndoStack->undo();
    QCOMPARE(a->getValue(), 3.0f);
}

void TestRkUndoStack::cancelTakesBackCameraFraming()
{
    auto* camera = new RkCamera;
    rkScene->addNode(camera);
    camera->setPosition(QVector3D(0, 1, 4));
    {
        RkUndoStackHold hold;
        // What framing the selection does: the camera's position moves.
        camera->setPosition(QVector3D(0.5f, 1.6f, 1.2f));
        QCOMPARE(camera->getPosition(), QVector3D(0.5f, 1.6f, 1.2f));
        hold.cancel();
    }
    QCOMPARE(camera->getPosition(), QVector3D(0, 1, 4));
    QCOMPARE(rkUndoStack->count(), 0);
}

void TestRkUndoStack::deletedPropertyIsSkipped()
{
    {
        RkUndoStackHold hold;
        a->setValue(1);
        b->setValue(1);
        hold.accept(QStringLiteral("Both"));
    }
    node->removeProperty(b);
    rkUndoStack->undo();
    QCOMPARE(a->getValue(), 0.0f);
    rkUndoStack->redo();
    QCOMPARE(a->getValue(), 1.0f);

    // Clearing the scene forgets the history.
    rkScene->clear();
    QVERIFY(!rkUndoStack->canUndo());
}

RK_TEST_MAIN(TestRkUndoStack)
#include "tst_rkundostack.moc"
