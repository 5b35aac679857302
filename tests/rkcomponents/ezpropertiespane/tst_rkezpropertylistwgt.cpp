#include "properties/rkboolproperty.h"
#include "properties/rkfloatproperty.h"
#include "properties/rkintproperty.h"
#include "rkezcompressedslider.h"
#include "rkezpropertiesslider.h"
#include "rkezpropertylistwgt.h"
#include "rktestmain.h"
#include "scene/rknode.h"
#include "scene/rkscene.h"
#include "undo/rkundostack.h"

#include <QDialog>
#include <QHeaderView>
#include <QLabel>
#include <QLineEdit>
#include <QPointer>
#include <QTimer>

namespace
{

const QString longLabel = QStringLiteral("A rather long morph name for one list row");

// The pointer crossing into and out of a widget, as the window system reports it. Sent
// directly: warping the real pointer leaves the order of crossing events to the X server.
void enter(QWidget* w)
{
    const QPoint local = w->rect().center();
    QEnterEvent event(local, w->mapTo(w->window(), local), w->mapToGlobal(local));
    QApplication::sendEvent(w, &event);
}

void leave(QWidget* w)
{
    QEvent event(QEvent::Leave);
    QApplication::sendEvent(w, &event);
}

void sendMove(QWidget* w, QPoint to)
{
    QMouseEvent move(QEvent::MouseMove, to, w->mapToGlobal(to), Qt::NoButton, Qt::LeftButton,
                     Qt::NoModifier);
    QApplication::sendEvent(w, &move);
}

void startDrag(QWidget* slider)
{
    const QPoint from(slider->width() / 3, 4);
    QTest::mousePress(slider, Qt::LeftButton, {}, from);
    sendMove(slider, from + QPoint(10, 0));
    sendMove(slider, from + QPoint(20, 0));
}

// Drags the handle at the right end of the Name column to x.
void dragNameHandle(QHeaderView* header, int x)
{
    QWidget* viewport = header->viewport();
    const QPoint from(header->sectionSize(0), header->height() / 2);
    QTest::mousePress(viewport, Qt::LeftButton, {}, from);
    sendMove(viewport, QPoint((from.x() + x) / 2, from.y()));
    sendMove(viewport, QPoint(x, from.y()));
    QTest::mouseRelease(viewport, Qt::LeftButton, {}, QPoint(x, from.y()));
}

QLabel* nameLabel(RkEzPropertiesSlider* row)
{
    return row->findChild<QLabel*>(QString(), Qt::FindDirectChildrenOnly);
}

} // namespace

class TestRkEzPropertyListWgt : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init();
    void cleanup();
    void rowsForFloatPropertiesOnly();
    void rowEditsAreOneUndoEntry();
    void nameColumnWidth();
    void nameDoubleClickOpensOptions();
    void rowSurvivesDeletion_data();
    void rowSurvivesDeletion();
    void narrowHeaderKeepsNameColumnAndLabelsTogether();

private:
    RkEzPropertyListWgt* makeList(const QVector<RkProperty*>& properties, int width = 400);

    std::unique_ptr<QWidget> m_window;
    std::vector<std::unique_ptr<RkProperty>> m_properties;
};

void TestRkEzPropertyListWgt::init()
{
    rkUndoStack->clear();
    m_properties.clear();
    for (const QString& label : {QStringLiteral("Jaw"), longLabel}) {
        auto property = std::make_unique<RkFloatProperty>(label.toLower(), label);
        property->setMinMax(-1.f, 1.f);
        property->setClamped(true);
        property->setDisplayAsPercent(true);
        property->setValue(0.2f);
        m_properties.push_back(std::move(property));
    }
}

void TestRkEzPropertyListWgt::cleanup()
{
    m_window.reset();
    m_properties.clear();
}

RkEzPropertyListWgt* TestRkEzPropertyListWgt::makeList(const QVector<RkProperty*>& properties,
                                                       int width)
{
    m_window = std::make_unique<QWidget>();
    m_window->setGeometry(200, 200, 500, 400);
    auto* list = new RkEzPropertyListWgt(m_window.get(), nullptr);
    list->setGeometry(0, 0, width, 300);
    list->addProperties(properties);
    m_window->show();
    if (!QTest::qWaitForWindowExposed(m_window.get()))
        return nullptr;
    return list;
}

void TestRkEzPropertyListWgt::rowsForFloatPropertiesOnly()
{
    RkBoolProperty flag(QStringLiteral("flag"), QStringLiteral("Flag"));
    RkIntProperty count(QStringLiteral("count"), QStringLiteral("Count"));
    auto* jaw = m_properties[0].get();
    auto* other = m_properties[1].get();
    RkEzPropertyListWgt* list = makeList({jaw, &flag, &count, other});
    QVERIFY(list);
    const QList<RkEzPropertiesSlider*> rows = list->getRows();
    QCOMPARE(rows.count(), 2);
    QCOMPARE(rows[0]->getProperty(), jaw);
    QCOMPARE(rows[1]->getProperty(), other);
    QVERIFY(rows[0]->y() < rows[1]->y());
    QCOMPARE(nameLabel(rows[0])->text(), QStringLiteral("Jaw"));
    QCOMPARE(rows[0]->getSlider()->getValueText(), QStringLiteral("20.0%"));
}

void TestRkEzPropertyListWgt::rowEditsAreOneUndoEntry()
{
    auto* jaw = static_cast<RkFloatProperty*>(m_properties[0].get());
    RkEzPropertyListWgt* list = makeList({jaw});
    QVERIFY(list);
    RkEzPropertiesSlider* row = list->getRows().value(0);
    RkEzCompressedSlider* slider = row->getSlider();

    // Dragging the bar.
    startDrag(slider);
    QVERIFY(jaw->getValue() > 0.3f);
    QTest::mouseRelease(slider, Qt::LeftButton, {}, QPoint(slider->width() / 3 + 20, 4));
    QVERIFY(!rkUndoStack->canPushItems());
    QCOMPARE(rkUndoStack->count(), 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Jaw"));

    // Typing a value into the value text at the right end.
    QTest::mouseClick(slider, Qt::LeftButton, {}, QPoint(slider->width() - 5, 8));
    auto* editor = slider->findChild<QLineEdit*>(QStringLiteral("SliderEditor"));
    QVERIFY(editor && editor->isVisible());
    QVERIFY(editor->geometry().right() < slider->width() - 1);
    editor->selectAll();
    QTest::keyClicks(editor, QStringLiteral("25"));
    QTest::keyClick(editor, Qt::Key_Return);
    QCOMPARE(jaw->getValue(), 0.25f);
    QCOMPARE(rkUndoStack->count(), 2);

    // Resting on the name previews at full strength and leaves nothing.
    enter(nameLabel(row));
    QVERIFY(row->isPreviewing());
    QCOMPARE(jaw->getValue(), 1.f);
    QCOMPARE(slider->getValueText(), QStringLiteral("100.0%"));
    leave(nameLabel(row));
    QVERIFY(!row->isPreviewing());
    QCOMPARE(jaw->getValue(), 0.25f);
    QCOMPARE(rkUndoStack->count(), 2);
    QVERIFY(!rkUndoStack->canPushItems());
}

void TestRkEzPropertyListWgt::nameColumnWidth()
{
    RkEzPropertyListWgt* list = makeList({m_properties[0].get(), m_properties[1].get()});
    QVERIFY(list);
    QHeaderView* header = list->getHeader();
    QLabel* longName = nameLabel(list->getRows()[1]);

    dragNameHandle(header, 60);
    QCOMPARE(header->sectionSize(0), 60);
    QCOMPARE(longName->width(), 60);
    QVERIFY(longName->text().endsWith(QChar(0x2026)));
    QVERIFY(longName->text().length() < longLabel.length());

    // The Value column keeps its minimum width.
    dragNameHandle(header, 2000);
    const int limit = header->width() - header->minimumSectionSize();
    QCOMPARE(header->sectionSize(0), limit);
    QCOMPARE(longName->width(), limit);
    QVERIFY(header->sectionSize(1) >= header->minimumSectionSize());

    dragNameHandle(header, 80);
    const QPoint valueHandle(header->width() - 1, header->height() / 2);
    QTest::mouseDClick(header->viewport(), Qt::LeftButton, {}, valueHandle);
    QCOMPARE(header->sectionSize(0), 80);

    // Fits the longest name, shown whole.
    QTest::mouseDClick(header->viewport(), Qt::LeftButton, {}, QPoint(79, header->height() / 2));
    const int fit = longName->fontMetrics().horizontalAdvance(longLabel);
    QCOMPARE(header->sectionSize(0), fit);
    QCOMPARE(longName->width(), fit);
    QCOMPARE(longName->text(), longLabel);
}

void TestRkEzPropertyListWgt::nameDoubleClickOpensOptions()
{
    auto* jaw = static_cast<RkFloatProperty*>(m_properties[0].get());
    RkEzPropertyListWgt* list = makeList({jaw});
    QVERIFY(list);
    RkEzPropertiesSlider* row = list->getRows()[0];
    enter(nameLabel(row));
    QVERIFY(row->isPreviewing());

    QString title;
    float valueDuringDialog = -1.f;
    QTimer::singleShot(0, [&] {
        auto* dialog = qobject_cast<QDialog*>(QApplication::activeModalWidget());
        if (!dialog)
            return;
        title = dialog->windowTitle();
        valueDuringDialog = jaw->getValue();
        dialog->reject();
    });
    QTest::mouseDClick(nameLabel(row), Qt::LeftButton);
    QVERIFY(title.contains(QStringLiteral("Jaw")));
    // The preview ended before the dialog came up.
    QCOMPARE(valueDuringDialog, 0.2f);
    leave(nameLabel(row));
    QVERIFY(!row->isPreviewing());
    QCOMPARE(jaw->getValue(), 0.2f);
    QCOMPARE(rkUndoStack->count(), 0);
    QVERIFY(!rkUndoStack->canPushItems());
}

void TestRkEzPropertyListWgt::rowSurvivesDeletion_data()
{
    QTest::addColumn<bool>("editing");
    QTest::addColumn<bool>("deleteRow");
    QTest::newRow("property deleted while hovered") << false << false;
    QTest::newRow("property deleted mid drag") << true << false;
    QTest::newRow("row deleted while hovered") << false << true;
    QTest::newRow("row deleted mid drag") << true << true;
}

void TestRkEzPropertyListWgt::rowSurvivesDeletion()
{
    QFETCH(bool, editing);
    QFETCH(bool, deleteRow);
    auto* node = new RkNode;
    rkScene->addNode(node);
    auto* blink = new RkFloatProperty(QStringLiteral("blink"), QStringLiteral("Blink"));
    blink->setValue(0.1f);
    node->addProperty(blink, QStringLiteral("Morphs"));
    RkEzPropertyListWgt* list = makeList({blink});
    QVERIFY(list);
    QPointer<RkEzPropertiesSlider> row = list->getRows()[0];
    RkEzCompressedSlider* slider = row->getSlider();
    if (editing)
        startDrag(slider);
    else
        enter(nameLabel(row));
    QVERIFY(rkUndoStack->canPushItems());
    const float during = blink->getValue();

    if (deleteRow) {
        delete row;
        QVERIFY(!rkUndoStack->canPushItems());
        QVERIFY(!blink->isEditing());
        QCOMPARE(rkUndoStack->count(), editing ? 1 : 0);
        QCOMPARE(blink->getValue(), editing ? during : 0.1f);
        rkScene->removeNode(node);
        return;
    }

    rkScene->removeNode(node);
    QVERIFY(!rkUndoStack->canPushItems());
    QVERIFY(!row->getProperty());
    QVERIFY(nameLabel(row)->text().isEmpty());
    QVERIFY(!slider->isVisible());
    sendMove(slider, QPoint(60, 4));
    QTest::mouseRelease(slider, Qt::LeftButton, {}, QPoint(60, 4));
    leave(nameLabel(row));
    QTest::mouseDClick(nameLabel(row), Qt::LeftButton);
    QVERIFY(!rkUndoStack->canPushItems());
    QCOMPARE(rkUndoStack->count(), 0);
}

void TestRkEzPropertyListWgt::narrowHeaderKeepsNameColumnAndLabelsTogether()
{
    RkEzPropertyListWgt* narrow = makeList({m_properties[0].get()}, 12);
    QVERIFY(narrow);
    QVERIFY(narrow->getHeader()->width() < narrow->getHeader()->minimumSectionSize());
    QCOMPARE(nameLabel(narrow->getRows()[0])->width(), 0);

    // A wide list shown next takes over the shared width: its Name column at its narrowest, not
    // left where it was.
    auto* wide = new RkEzPropertyListWgt(m_window.get(), nullptr);
    wide->setGeometry(0, 100, 400, 200);
    wide->addProperties({m_properties[1].get()});
    wide->show();
    QHeaderView* header = wide->getHeader();
    QCOMPARE(header->sectionSize(0), header->minimumSectionSize());
    QCOMPARE(nameLabel(wide->getRows()[0])->width(), 0);
}

RK_TEST_MAIN(TestRkEzPropertyListWgt)
#include "tst_rkezpropertylistwgt.moc"
