#include "rkezpropertiesdragger.h"

#include "properties/rkfloatproperty.h"
#include "rkezicongridwgt.h"
#include "rkezpropertiescontrol.h"
#include "rktestmain.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostack.h"
#include "undo/rkundostackhold.h"

#include <QGridLayout>
#include <QPointer>
#include <QPushButton>

namespace
{

// An icon grid of eight morph tiles around the handle, as a page shows it.
struct Page {
    RkSkeleton figure;
    QVector<QPointer<RkFloatProperty>> morphs;
    RkEzIconGridWgt grid{nullptr, nullptr};
    QVector<RkEzPropertiesControl*> tiles;
    RkEzPropertiesDragger* dragger = nullptr;
    QPoint grab{20, 20};

    Page()
    {
        QVector<RkProperty*> set;
        for (int i = 0; i < 8; ++i) {
            const QString name = QString("Morph %1").arg(i);
            auto* morph = new RkFloatProperty(name, name);
            figure.addProperty(morph, QStringLiteral("Morphs"));
            morphs.append(morph);
            set.append(morph);
        }
        grid.resize(300, 360);
        grid.addProperties(set);
        grid.show();
        tiles = grid.getTiles();
        dragger = grid.getDragger();
    }

    QVector<float> values() const
    {
        QVector<float> v;
        for (const auto& morph : morphs)
            v.append(morph ? morph->getValue() : -1.f);
        return v;
    }

    void press() { QTest::mousePress(dragger, Qt::LeftButton, Qt::NoModifier, grab); }
    // Drags the handle's top-left corner towards `target` (the bounds may stop it short).
    void moveHandleTo(const QPoint& target)
    {
        const QPoint local = grab + target - dragger->pos();
        QMouseEvent move(QEvent::MouseMove, local, dragger->mapToGlobal(local), Qt::NoButton,
                         Qt::LeftButton, Qt::NoModifier);
        QApplication::sendEvent(dragger, &move);
    }
    void release() { QTest::mouseRelease(dragger, Qt::LeftButton, Qt::NoModifier, grab); }
};

} // namespace

class TestRkEzPropertiesDragger : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void cleanup();
    void dragMixesIntoOneUndoEntry();
    void goneTilesAndDestroyedHandle();
};

void TestRkEzPropertiesDragger::cleanup()
{
    rkUndoStack->clear();
}

void TestRkEzPropertiesDragger::dragMixesIntoOneUndoEntry()
{
    Page page;
    QVERIFY(QTest::qWaitForWindowExposed(&page.grid));
    const QPoint start = page.grid.findChild<QGridLayout*>()->cellRect(1, 1).topLeft();
    QCOMPARE(page.dragger->pos(), start);
    auto* undoButton = page.dragger->findChild<QPushButton*>(QStringLiteral("Undo"));
    QVERIFY(undoButton && undoButton->isHidden());
    // Morph 0 at 0.4 shows a hover preview at full strength, which the press ends.
    page.morphs[0]->setValue(0.4f);
    page.tiles[0]->beginPreview();
    QCOMPARE(page.morphs[0]->getValue(), 1.f);
    const int entries = rkUndoStack->count();

    // Near tile 1's corner only tile 1 rises, by the closeness.
    const int reach = std::min(page.tiles[1]->width(), page.tiles[1]->height());
    page.press();
    QVERIFY(!page.tiles[0]->isPreviewing());
    page.moveHandleTo(page.tiles[1]->pos() + QPoint(0, 10));
    QCOMPARE(page.values(), (QVector<float>{0.4f, 1.f - 10.f / reach, 0, 0, 0, 0, 0, 0}));
    // On tile 0's corner: no clamping, and the tile left behind falls back.
    page.moveHandleTo(QPoint(-30, -50));
    QCOMPARE(page.dragger->pos(), page.tiles[0]->pos());
    QCOMPARE(page.values(), (QVector<float>{1.4f, 0, 0, 0, 0, 0, 0, 0}));
    // Past the far corner the handle stops on the last tile's corner.
    page.moveHandleTo(QPoint(900, 900));
    QCOMPARE(page.dragger->pos(), page.tiles[7]->pos());
    page.release();

    QCOMPARE(page.dragger->pos(), start);
    const QVector<float> mixed{0.4f, 0, 0, 0, 0, 0, 0, 1.f};
    QCOMPARE(page.values(), mixed);
    QCOMPARE(rkUndoStack->count(), entries + 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Mixer Drag"));
    QVERIFY(!rkUndoStack->canPushItems());
    QVERIFY(!undoButton->isHidden());

    // A drag that moves nothing leaves no entry.
    page.press();
    page.moveHandleTo(start);
    page.release();
    QCOMPARE(rkUndoStack->count(), entries + 1);

    // Another kind of entry on top hides the button; undoing it shows it again.
    {
        RkUndoStackHold hold;
        page.morphs[3]->setValue(0.7f);
        hold.accept(QStringLiteral("Morph 3"));
    }
    QVERIFY(undoButton->isHidden());
    rkUndoStack->undo();
    QVERIFY(!undoButton->isHidden());
    QTest::mouseClick(undoButton, Qt::LeftButton);
    QCOMPARE(page.values(), (QVector<float>{0.4f, 0, 0, 0, 0, 0, 0, 0}));
    QVERIFY(undoButton->isHidden());
}

void TestRkEzPropertiesDragger::goneTilesAndDestroyedHandle()
{
    Page page;
    QVERIFY(QTest::qWaitForWindowExposed(&page.grid));
    const int entries = rkUndoStack->count();

    page.press();
    page.moveHandleTo(page.tiles[0]->pos());
    // Morph 1 and tile 3 go in the middle of the drag; the handle passes over their places.
    const QPoint tile3 = page.tiles[3]->pos();
    page.figure.removeProperty(page.morphs[1]);
    delete page.morphs[1];
    delete page.tiles[3];
    QVERIFY(!page.morphs[1]);
    page.moveHandleTo(page.tiles[1]->pos());
    page.moveHandleTo(tile3);
    QCOMPARE(page.values(), (QVector<float>{0, -1.f, 0, 0, 0, 0, 0, 0}));
    page.moveHandleTo(page.tiles[0]->pos() + QPoint(5, 5));
    const QVector<float> mixed = page.values();
    QVERIFY(mixed[0] > 0.5f);

    // The handle goes while its button is down: the drag ends with it, as one entry.
    delete page.dragger;
    QVERIFY(!rkUndoStack->canPushItems());
    QCOMPARE(rkUndoStack->count(), entries + 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Mixer Drag"));
    QCOMPARE(page.values(), mixed);
    rkUndoStack->undo();
    QCOMPARE(page.values(), (QVector<float>{0, -1.f, 0, 0, 0, 0, 0, 0}));
}

RK_TEST_MAIN(TestRkEzPropertiesDragger)
#include "tst_rkezpropertiesdragger.moc"
