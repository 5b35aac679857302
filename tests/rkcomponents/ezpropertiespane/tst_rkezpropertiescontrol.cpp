#include "properties/rkfloatproperty.h"
#include "rkezpropertiescontrol.h"
#include "rktestmain.h"
#include "scene/rknode.h"
#include "scene/rkscene.h"
#include "undo/rkundostack.h"
#include "undo/rkundostackhold.h"
#include "widgets/rkfloatslider.h"

#include <QFrame>
#include <QLabel>
#include <QPointer>

namespace
{

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

// Presses on the slider's bar and drags right; the caller releases (or not).
void startDrag(RkFloatSlider* slider)
{
    const QPoint from = slider->rect().center();
    QTest::mousePress(slider, Qt::LeftButton, {}, from);
    sendMove(slider, from + QPoint(10, 0));
    sendMove(slider, from + QPoint(20, 0));
}

} // namespace

class TestRkEzPropertiesControl : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init();
    void cleanup();
    void sliderGestureIsOneUndoEntry_data();
    void sliderGestureIsOneUndoEntry();
    void hoverPreview_data();
    void hoverPreview();
    void survivesDeletionMidGesture_data();
    void survivesDeletionMidGesture();

private:
    // The tile in a shown window with the pointer away from it.
    void makeTile(RkFloatProperty* property);
    QFrame* imageFrame() const;
    QFrame* labelFrame() const;
    QLabel* valueLabel() const;
    QLabel* nameLabel() const;

    std::unique_ptr<QWidget> m_window;
    QPointer<RkEzPropertiesControl> m_tile;
    std::unique_ptr<RkFloatProperty> m_property;
};

void TestRkEzPropertiesControl::init()
{
    rkUndoStack->clear();
    rkScene->setPlaying(false);
    m_property =
        std::make_unique<RkFloatProperty>(QStringLiteral("smile"), QStringLiteral("Smile"));
    m_property->setMinMax(-1.f, 1.f);
    m_property->setClamped(true);
}

void TestRkEzPropertiesControl::cleanup()
{
    m_window.reset();
    m_property.reset();
}

void TestRkEzPropertiesControl::makeTile(RkFloatProperty* property)
{
    m_window = std::make_unique<QWidget>();
    m_window->setGeometry(200, 200, 300, 300);
    m_tile = new RkEzPropertiesControl(property, m_window.get(), nullptr);
    m_tile->setGeometry(100, 50, 100, 130);
    m_window->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_window.get()));
}

QFrame* TestRkEzPropertiesControl::imageFrame() const
{
    return m_tile->findChildren<QFrame*>(QString(), Qt::FindDirectChildrenOnly).value(0);
}

QFrame* TestRkEzPropertiesControl::labelFrame() const
{
    return m_tile->findChildren<QFrame*>(QString(), Qt::FindDirectChildrenOnly).value(1);
}

QLabel* TestRkEzPropertiesControl::valueLabel() const
{
    return imageFrame()->findChild<QLabel*>();
}

QLabel* TestRkEzPropertiesControl::nameLabel() const
{
    return labelFrame()->findChild<QLabel*>();
}

void TestRkEzPropertiesControl::sliderGestureIsOneUndoEntry_data()
{
    QTest::addColumn<QString>("label");
    QTest::addColumn<bool>("cancel");
    QTest::addColumn<QString>("caption");
    QTest::newRow("drag") << "Smile" << false << "Smile";
    QTest::newRow("unnamed") << "" << false << "Unnamed";
    QTest::newRow("escape") << "Smile" << true << "";
}

void TestRkEzPropertiesControl::sliderGestureIsOneUndoEntry()
{
    QFETCH(QString, label);
    QFETCH(bool, cancel);
    QFETCH(QString, caption);
    m_property->setLabel(label);
    m_property->setValue(0.1f);
    makeTile(m_property.get());
    QCOMPARE(valueLabel()->text(), QStringLiteral("10%"));

    RkFloatSlider* slider = m_tile->getSlider();
    QVERIFY(!slider->isVisible());
    enter(labelFrame());
    QVERIFY(slider->isVisible());
    QCOMPARE(slider->size(), nameLabel()->size());

    startDrag(slider);
    QCOMPARE(valueLabel()->text(), QStringLiteral("30%"));
    if (cancel)
        QTest::keyClick(slider, Qt::Key_Escape);
    QTest::mouseRelease(slider, Qt::LeftButton, {}, slider->rect().center() + QPoint(20, 0));

    QVERIFY(!rkUndoStack->canPushItems());
    QVERIFY(!m_property->isEditing());
    QCOMPARE(rkUndoStack->count(), cancel ? 0 : 1);
    if (cancel) {
        QCOMPARE(m_property->getValue(), 0.1f);
        return;
    }
    QCOMPARE(rkUndoStack->getUndoCaption(), caption);
    rkUndoStack->undo();
    QCOMPARE(m_property->getValue(), 0.1f);
    QCOMPARE(valueLabel()->text(), QStringLiteral("10%"));
}

void TestRkEzPropertiesControl::hoverPreview_data()
{
    QTest::addColumn<float>("value");
    QTest::addColumn<bool>("playing");
    QTest::addColumn<bool>("otherHold");
    QTest::addColumn<bool>("previews");
    QTest::newRow("0.3") << 0.3f << false << false << true;
    QTest::newRow("-0.257") << -0.257f << false << false << true;
    QTest::newRow("half") << 0.5f << false << false << false;
    QTest::newRow("-0.7") << -0.7f << false << false << false;
    QTest::newRow("playing") << 0.3f << true << false << false;
    QTest::newRow("other edit open") << 0.3f << false << true << false;
}

void TestRkEzPropertiesControl::hoverPreview()
{
    QFETCH(float, value);
    QFETCH(bool, playing);
    QFETCH(bool, otherHold);
    QFETCH(bool, previews);
    m_property->setValue(value);
    makeTile(m_property.get());
    const QString text = valueLabel()->text();
    rkScene->setPlaying(playing);
    auto other = otherHold ? std::make_unique<RkUndoStackHold>() : nullptr;

    enter(imageFrame());
    QVERIFY(m_tile->isPointerOverImage());
    QCOMPARE(m_tile->isPreviewing(), previews);
    QCOMPARE(m_property->getValue(), previews ? 1.f : value);
    QCOMPARE(valueLabel()->text(), previews ? QStringLiteral("100%") : text);

    leave(imageFrame());
    QVERIFY(!m_tile->isPointerOverImage());
    other.reset();
    QVERIFY(!m_tile->isPreviewing());
    QCOMPARE(m_property->getValue(), value);
    QCOMPARE(valueLabel()->text(), text);
    QCOMPARE(rkUndoStack->count(), 0);
    QVERIFY(!rkUndoStack->canPushItems());
}

void TestRkEzPropertiesControl::survivesDeletionMidGesture_data()
{
    QTest::addColumn<bool>("editing");
    QTest::addColumn<bool>("deleteTile");
    QTest::newRow("property deleted while hovered") << false << false;
    QTest::newRow("property deleted mid drag") << true << false;
    QTest::newRow("tile deleted while hovered") << false << true;
    QTest::newRow("tile deleted mid drag") << true << true;
}

void TestRkEzPropertiesControl::survivesDeletionMidGesture()
{
    QFETCH(bool, editing);
    QFETCH(bool, deleteTile);
    auto* node = new RkNode;
    rkScene->addNode(node);
    auto* blink = new RkFloatProperty(QStringLiteral("blink"), QStringLiteral("Blink"));
    blink->setValue(0.2f);
    node->addProperty(blink, QStringLiteral("Morphs"));
    makeTile(blink);
    RkFloatSlider* slider = m_tile->getSlider();
    if (editing) {
        enter(labelFrame());
        QVERIFY(slider->isVisible());
        startDrag(slider);
    } else {
        enter(imageFrame());
    }
    QVERIFY(rkUndoStack->canPushItems());
    const float during = blink->getValue();
    QVERIFY(during != 0.2f);

    if (deleteTile) {
        // A drag keeps what it did as one entry; a preview goes back and leaves none.
        delete m_tile;
        QVERIFY(!rkUndoStack->canPushItems());
        QVERIFY(!blink->isEditing());
        QCOMPARE(rkUndoStack->count(), editing ? 1 : 0);
        QCOMPARE(blink->getValue(), editing ? during : 0.2f);
        rkScene->removeNode(node);
        return;
    }

    rkScene->removeNode(node);
    QVERIFY(!m_tile->getProperty());
    QVERIFY(!rkUndoStack->canPushItems());
    QVERIFY(!m_tile->isPreviewing());
    QVERIFY(!slider->isVisible());
    QVERIFY(nameLabel()->text().isEmpty());
    QVERIFY(valueLabel()->text().isEmpty());
    // What the user does next reaches nothing.
    sendMove(slider, slider->rect().center() + QPoint(40, 0));
    enter(labelFrame());
    enter(imageFrame());
    QVERIFY(!rkUndoStack->canPushItems());
    QCOMPARE(rkUndoStack->count(), 0);
}

RK_TEST_MAIN(TestRkEzPropertiesControl)
#include "tst_rkezpropertiescontrol.moc"
