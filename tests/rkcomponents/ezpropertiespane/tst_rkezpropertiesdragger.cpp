#include "rkezpropertiesdragger.h"

#include "properties/rkfloatproperty.h"
#include "rktestmain.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostack.h"
#include "undo/rkundostackhold.h"

#include <QGridLayout>
#include <QPointer>
#include <QPushButton>

#include <cmath>

namespace
{

// Eight plain tiles of 80 by 80 around the handle in the middle cell, each showing one morph of
// a figure; tile i's top-left corner is the handle's position that raises its morph fully.
struct Page {
    QWidget widget;
    QGridLayout* grid = nullptr;
    QVector<QWidget*> tiles;
    RkSkeleton figure;
    QVector<QPointer<RkFloatProperty>> morphs;
    RkEzPropertiesDragger* dragger = nullptr;
    QPoint grab{40, 40};

    Page()
    {
        grid = new QGridLayout(&widget);
        grid->setContentsMargins(0, 0, 0, 0);
        grid->setSpacing(0);
        widget.resize(240, 240);
        for (int cell = 0; cell < 9; ++cell) {
            if (cell == 4)
                continue;
            auto* tile = new QWidget(&widget);
            tile->setFixedSize(80, 80);
            grid->addWidget(tile, cell / 3, cell % 3);
            tiles.append(tile);
            const QString name = QString("Morph %1").arg(tiles.size() - 1);
            auto* morph = new RkFloatProperty(name, name);
            figure.addProperty(morph, QStringLiteral("Morphs"));
            morphs.append(morph);
        }
        dragger = new RkEzPropertiesDragger(&widget);
        for (int i = 0; i < tiles.size(); ++i)
            dragger->addTile(tiles[i], morphs[i]);
        dragger->setMixArea(grid);
        widget.show();
        grid->activate();
        dragger->setGeometry(grid->cellRect(1, 1));
        dragger->setHandleVisible(true);
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
    QVERIFY(QTest::qWaitForWindowExposed(&page.widget));
    QCOMPARE(page.dragger->pos(), QPoint(80, 80));
    auto* undoButton = page.dragger->findChild<QPushButton*>(QStringLiteral("Undo"));
    QVERIFY(undoButton && undoButton->isHidden());
    // Morph 0 shows a hover preview at full strength, which ends before the drag takes values.
    page.morphs[0]->setValue(1.f);
    connect(page.dragger, &RkEzPropertiesDragger::mixStarting, &page.widget,
            [&page] { page.morphs[0]->setValue(0.4f); });
    const int entries = rkUndoStack->count();

    // Halfway to morph 0's corner touches its three nearest tiles alike.
    page.press();
    page.moveHandleTo(QPoint(40, 40));
    QVector<float> v = page.values();
    QVERIFY(qAbs(v[1] - (1.f - std::sqrt(2.f) / 2.f)) < 1e-5f);
    QCOMPARE(v, (QVector<float>{0.4f + v[1], v[1], 0, v[1], 0, 0, 0, 0}));
    // On the corner: no clamping, and the tiles left behind fall back.
    page.moveHandleTo(QPoint(-30, -50));
    QCOMPARE(page.dragger->pos(), QPoint(0, 0));
    QCOMPARE(page.values(), (QVector<float>{1.4f, 0, 0, 0, 0, 0, 0, 0}));
    // Past the far corner the handle stops on the last tile's corner.
    page.moveHandleTo(QPoint(400, 300));
    QCOMPARE(page.dragger->pos(), QPoint(160, 160));
    page.release();

    QCOMPARE(page.dragger->pos(), QPoint(80, 80));
    const QVector<float> mixed{0.4f, 0, 0, 0, 0, 0, 0, 1.f};
    QCOMPARE(page.values(), mixed);
    QCOMPARE(rkUndoStack->count(), entries + 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Mixer Drag"));
    QVERIFY(!rkUndoStack->canPushItems());
    QVERIFY(!undoButton->isHidden());

    // A drag that moves nothing leaves no entry.
    page.press();
    page.moveHandleTo(QPoint(80, 80));
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
    QVERIFY(QTest::qWaitForWindowExposed(&page.widget));
    const int entries = rkUndoStack->count();

    page.press();
    page.moveHandleTo(QPoint(0, 0));
    // Morph 1 and tile 3 go in the middle of the drag; the handle passes over their places.
    page.figure.removeProperty(page.morphs[1]);
    delete page.morphs[1];
    delete page.tiles[3];
    QVERIFY(!page.morphs[1]);
    page.moveHandleTo(QPoint(80, 0));
    page.moveHandleTo(QPoint(0, 80));
    QCOMPARE(page.values(), (QVector<float>{0, -1.f, 0, 0, 0, 0, 0, 0}));
    page.moveHandleTo(QPoint(20, 20));
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
