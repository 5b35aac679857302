#include "app/rkapp.h"
#include "properties/rkfloatproperty.h"
#include "properties/rkintproperty.h"
#include "rktestmain.h"
#include "scene/rkcamera.h"
#include "scene/rkscene.h"
#include "undo/rkundostack.h"
#include "undo/rkundostackhold.h"

#include <QSignalSpy>

#include <limits>

namespace
{

// Sets an int as a property change sets a value, and logs every call so the order shows.
class SetInt : public RkUndoCommand
{
public:
    SetInt(int* target, int before, int after, QStringList* log, bool folds = true)
        : RkUndoCommand(QStringLiteral("Set %1").arg(after)), m_target(target), m_before(before),
          m_after(after), m_log(log), m_folds(folds)
    {
    }
    void undo() override
    {
        *m_target = m_before;
        m_log->append(QStringLiteral("undo %1").arg(m_after));
    }
    void redo() override
    {
        *m_target = m_after;
        m_log->append(QStringLiteral("redo %1").arg(m_after));
    }
    const void* mergeKey() const override { return m_folds ? m_target : nullptr; }
    void mergeWith(const RkUndoCommand& later) override
    {
        m_after = static_cast<const SetInt&>(later).m_after;
    }
    bool isNoChange() const override { return m_before == m_after; }

private:
    int* m_target;
    int m_before, m_after;
    QStringList* m_log;
    bool m_folds;
};

// Same key as SetInt, another class: the two never fold together.
class OtherSetInt : public SetInt
{
    using SetInt::SetInt;
};

// While the stack applies it: pushes a command, and clears the history if asked to.
class Meddler : public RkUndoCommand
{
public:
    Meddler(int* target, bool clears) : m_target(target), m_clears(clears) {}
    void undo() override { meddle(); }
    void redo() override { meddle(); }

private:
    void meddle()
    {
        rkUndoStack->push(std::make_unique<SetInt>(m_target, 0, 1, &m_log));
        if (m_clears)
            rkUndoStack->clear();
    }
    int* m_target;
    bool m_clears;
    QStringList m_log;
};

} // namespace

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
    void pushedCommandsJoinTheHold();
    void pushWithoutHoldIsAnEntryOfItsOwn();
    void commandsFoldThroughTheirKey();
    void commandsCannotChangeTheStackWhileApplied();

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

void TestRkUndoStack::pushedCommandsJoinTheHold()
{
    QStringList log;
    int x = 0, y = 0;
    {
        RkUndoStackHold hold;
        x = 1;
        rkUndoStack->push(std::make_unique<SetInt>(&x, 0, 1, &log));
        a->setValue(2);
        y = 3;
        rkUndoStack->push(std::make_unique<SetInt>(&y, 0, 3, &log));
        hold.accept(QStringLiteral("Mixed"));
    }
    QVERIFY(log.isEmpty()); // pushing records a change already made
    QCOMPARE(rkUndoStack->count(), 1);
    rkUndoStack->undo();
    QCOMPARE(log, QStringList({"undo 3", "undo 1"}));
    QCOMPARE(a->getValue(), 0.0f);
    QCOMPARE(x, 0);
    log.clear();
    rkUndoStack->redo();
    QCOMPARE(log, QStringList({"redo 1", "redo 3"}));
    QCOMPARE(a->getValue(), 2.0f);
    QCOMPARE(y, 3);

    // An inner hold's cancel takes back its own commands, the outer one's the rest.
    log.clear();
    {
        RkUndoStackHold outer;
        x = 4;
        rkUndoStack->push(std::make_unique<SetInt>(&x, 1, 4, &log));
        {
            RkUndoStackHold inner;
            y = 5;
            rkUndoStack->push(std::make_unique<SetInt>(&y, 3, 5, &log));
            a->setValue(6);
        }
        QCOMPARE(log, QStringList({"undo 5"}));
        QCOMPARE(a->getValue(), 2.0f);
        outer.cancel();
    }
    QCOMPARE(log, QStringList({"undo 5", "undo 4"}));
    QCOMPARE(x, 1);
    QCOMPARE(rkUndoStack->count(), 1);
}

void TestRkUndoStack::pushWithoutHoldIsAnEntryOfItsOwn()
{
    QSignalSpy captions(rkUndoStack, &RkUndoStack::undoCaptionChanged);
    QStringList log;
    int x = 2;
    rkUndoStack->push(std::make_unique<SetInt>(&x, 0, 2, &log));
    QVERIFY(log.isEmpty());
    QCOMPARE(rkUndoStack->count(), 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Set 2"));
    QCOMPARE(captions.count(), 1);
    // A command that changes nothing leaves no entry.
    rkUndoStack->push(std::make_unique<SetInt>(&x, 2, 2, &log));
    QCOMPARE(rkUndoStack->count(), 1);
    rkUndoStack->undo();
    QCOMPARE(x, 0);
    QCOMPARE(rkUndoStack->getRedoCaption(), QStringLiteral("Set 2"));
}

void TestRkUndoStack::commandsFoldThroughTheirKey()
{
    QStringList log;
    int x = 0, y = 0;
    {
        RkUndoStackHold hold;
        rkUndoStack->push(std::make_unique<SetInt>(&x, 0, 1, &log));
        rkUndoStack->push(std::make_unique<SetInt>(&y, 0, 5, &log));
        rkUndoStack->push(std::make_unique<SetInt>(&x, 1, 2, &log));
        rkUndoStack->push(std::make_unique<SetInt>(&x, 2, 3, &log));
        hold.accept(QStringLiteral("Drag"));
    }
    rkUndoStack->undo();
    QCOMPARE(log, QStringList({"undo 5", "undo 3"}));
    QCOMPARE(x, 0);

    // Folding stops at another class with the same key and at a command that never folds.
    log.clear();
    {
        RkUndoStackHold hold;
        rkUndoStack->push(std::make_unique<SetInt>(&x, 0, 1, &log));
        rkUndoStack->push(std::make_unique<OtherSetInt>(&x, 1, 2, &log));
        rkUndoStack->push(std::make_unique<SetInt>(&x, 2, 3, &log));
        rkUndoStack->push(std::make_unique<SetInt>(&y, 0, 9, &log, false));
        rkUndoStack->push(std::make_unique<SetInt>(&x, 3, 4, &log));
        rkUndoStack->push(std::make_unique<SetInt>(&x, 4, 5, &log));
        hold.accept(QStringLiteral("Steps"));
    }
    rkUndoStack->undo();
    QCOMPARE(log, QStringList({"undo 5", "undo 9", "undo 3", "undo 2", "undo 1"}));
}

void TestRkUndoStack::commandsCannotChangeTheStackWhileApplied()
{
    int x = 0;
    rkUndoStack->push(std::make_unique<Meddler>(&x, false));
    rkUndoStack->undo();
    QCOMPARE(rkUndoStack->count(), 1);
    rkUndoStack->redo();
    QCOMPARE(rkUndoStack->count(), 1);
    QVERIFY(!rkUndoStack->canRedo());
    {
        RkUndoStackHold outer;
        {
            RkUndoStackHold inner;
            rkUndoStack->push(std::make_unique<Meddler>(&x, false));
        }
        outer.accept(QStringLiteral("Cancelled"));
    }
    QCOMPARE(rkUndoStack->count(), 1);

    // A clear asked for while undoing happens once the entry is undone.
    QSignalSpy canUndo(rkUndoStack, &RkUndoStack::canUndoChanged);
    rkUndoStack->push(std::make_unique<Meddler>(&x, true));
    rkUndoStack->undo();
    QCOMPARE(rkUndoStack->count(), 0);
    QVERIFY(!rkUndoStack->canRedo());
    QCOMPARE(canUndo.count(), 1);
    QVERIFY(!canUndo.last().at(0).toBool());
}

RK_TEST_MAIN(TestRkUndoStack)
#include "tst_rkundostack.moc"
