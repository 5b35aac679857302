#include "rktestmain.h"
#include "widgets/rkfloatslider.h"
#include "widgets/rkintslider.h"

#include <QLineEdit>
#include <QSignalSpy>
#include <QVBoxLayout>

#include <limits>

namespace
{

// The gesture signals of one slider, as "starts ends cancels".
struct Gestures {
    explicit Gestures(RkSlider* slider)
        : start(slider, &RkSlider::editStart), end(slider, &RkSlider::editEnd),
          cancel(slider, &RkSlider::editCancelled)
    {
    }
    QString counts() const
    {
        return QStringLiteral("%1 %2 %3").arg(start.count()).arg(end.count()).arg(cancel.count());
    }
    QSignalSpy start, end, cancel;
};

// A user's drag: press, two moves with the button held, release.
void drag(QWidget* w, QPoint from, int dx, Qt::KeyboardModifiers mods = Qt::NoModifier,
          bool release = true)
{
    QTest::mousePress(w, Qt::LeftButton, mods, from);
    for (const QPoint to : {from + QPoint(dx / 2, 0), from + QPoint(dx, 0)}) {
        QMouseEvent move(QEvent::MouseMove, to, w->mapToGlobal(to), Qt::NoButton, Qt::LeftButton,
                         mods);
        QApplication::sendEvent(w, &move);
    }
    if (release)
        QTest::mouseRelease(w, Qt::LeftButton, mods, from + QPoint(dx, 0));
}

bool wheel(QWidget* w, int notches)
{
    const QPoint pos = w->rect().center();
    QWheelEvent event(pos, w->mapToGlobal(pos), QPoint(), QPoint(0, 120 * notches), Qt::NoButton,
                      Qt::NoModifier, Qt::NoScrollPhase, false);
    QApplication::sendEvent(w, &event);
    return event.isAccepted();
}

// A row layout: value text on the left, bar on the right, no label row.
class TextLeftSlider : public RkFloatSlider
{
public:
    using RkFloatSlider::RkFloatSlider;
    QSize calcMinSize() override { return QSize(200, 20); }
    QRect calcSliderRect() override { return QRect(70, 0, width() - 70, height()); }
    QRect calcTextRect() override { return QRect(0, 0, 60, height()); }
    QRect calcEditRect() override { return calcTextRect(); }
    QRect calcLabelRect() override { return QRect(); }
};

} // namespace

class TestRkSlider : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init();
    void cleanup();
    void dragChangesBySensitivityPerPixel_data();
    void dragChangesBySensitivityPerPixel();
    void escCancelsDragAndRestores();
    void keysAndWheelStepInOneGestureEach();
    void typedText_data();
    void typedText();
    void clampedLimitsHold();
    void intSliderStepsWhole();
    void overriddenRectsDriveHitTesting();

private:
    template <typename T> T* showInWindow(T* slider);
    std::unique_ptr<QWidget> window;
    QLineEdit* other = nullptr; // somewhere else for the focus to be
    RkFloatSlider* slider = nullptr;
};

template <typename T> T* TestRkSlider::showInWindow(T* slider)
{
    window = std::make_unique<QWidget>();
    auto* layout = new QVBoxLayout(window.get());
    other = new QLineEdit(window.get());
    layout->addWidget(other);
    layout->addWidget(slider);
    window->resize(320, 80);
    window->show();
    window->activateWindow();
    if (!QTest::qWaitForWindowActive(window.get()))
        qWarning("test window not active");
    return slider;
}

void TestRkSlider::init()
{
    slider = showInWindow(new RkFloatSlider(nullptr, QStringLiteral("slider")));
    slider->setLabel(QStringLiteral("Bend"));
    slider->setMinMax(-1, 1);
    slider->setSensitivity(0.01f);
    slider->setValue(0.25f);
}

void TestRkSlider::cleanup()
{
    window.reset();
}

void TestRkSlider::dragChangesBySensitivityPerPixel_data()
{
    QTest::addColumn<int>("modifiers");
    QTest::addColumn<float>("expected");
    QTest::newRow("plain") << int(Qt::NoModifier) << 0.65f;
    QTest::newRow("shift finer") << int(Qt::ShiftModifier) << 0.29f;
    QTest::newRow("ctrl coarser") << int(Qt::ControlModifier) << 4.25f;
}

void TestRkSlider::dragChangesBySensitivityPerPixel()
{
    QFETCH(int, modifiers);
    QFETCH(float, expected);
    Gestures gestures(slider);
    QSignalSpy values(slider, &RkFloatSlider::valueChanged);
    drag(slider, slider->calcSliderRect().center() - QPoint(50, 0), 40,
         Qt::KeyboardModifiers(modifiers));
    QVERIFY(qAbs(slider->getValue() - expected) < 1e-5f);
    QCOMPARE(gestures.counts(), QStringLiteral("1 1 0"));
    QVERIFY(values.count() >= 1);
    QVERIFY(!slider->isEditing());

    // A click on the bar is no gesture.
    QTest::mouseClick(slider, Qt::LeftButton, {}, slider->calcSliderRect().center());
    QCOMPARE(gestures.counts(), QStringLiteral("1 1 0"));
}

void TestRkSlider::escCancelsDragAndRestores()
{
    Gestures gestures(slider);
    drag(slider, slider->calcSliderRect().center(), 30, Qt::NoModifier, false);
    QVERIFY(qAbs(slider->getValue() - 0.55f) < 1e-5f);
    QTest::keyClick(slider, Qt::Key_Escape);
    QCOMPARE(slider->getValue(), 0.25f);
    QCOMPARE(gestures.counts(), QStringLiteral("1 0 1"));
    // The rest of the drag does nothing.
    QMouseEvent move(QEvent::MouseMove, QPoint(5, 5), slider->mapToGlobal(QPoint(5, 5)),
                     Qt::NoButton, Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(slider, &move);
    QTest::mouseRelease(slider, Qt::LeftButton, {}, QPoint(5, 5));
    QCOMPARE(slider->getValue(), 0.25f);
    QCOMPARE(gestures.counts(), QStringLiteral("1 0 1"));
}

void TestRkSlider::keysAndWheelStepInOneGestureEach()
{
    Gestures gestures(slider);
    slider->setDefaultValue(-0.5f);
    slider->setFocus();
    QTest::keyClick(slider, Qt::Key_Right);
    QCOMPARE(slider->getValue(), 0.26f);
    QTest::keyClick(slider, Qt::Key_Left, Qt::ControlModifier);
    QVERIFY(qAbs(slider->getValue() - 0.16f) < 1e-6f);
    QTest::keyClick(slider, Qt::Key_Home);
    QCOMPARE(slider->getValue(), -0.5f);
    QCOMPARE(gestures.counts(), QStringLiteral("3 3 0"));
    // A held key: its repeats are one gesture.
    QTest::keyPress(slider, Qt::Key_Up);
    QKeyEvent repeat(QEvent::KeyPress, Qt::Key_Up, Qt::NoModifier, QString(), true);
    QApplication::sendEvent(slider, &repeat);
    QTest::keyRelease(slider, Qt::Key_Up);
    QCOMPARE(slider->getValue(), -0.48f);
    QCOMPARE(gestures.counts(), QStringLiteral("4 4 0"));

    QVERIFY(wheel(slider, 2));
    QCOMPARE(slider->getValue(), -0.46f);
    QCOMPARE(gestures.counts(), QStringLiteral("5 5 0"));
    // Unfocused, the wheel belongs to whatever the slider sits in.
    other->setFocus();
    QVERIFY(!wheel(slider, 2));
    QCOMPARE(slider->getValue(), -0.46f);
    QCOMPARE(gestures.counts(), QStringLiteral("5 5 0"));
}

void TestRkSlider::typedText_data()
{
    QTest::addColumn<bool>("percent");
    QTest::addColumn<QString>("shown");
    QTest::addColumn<QString>("typed");
    QTest::addColumn<int>("key");
    QTest::addColumn<float>("expected");
    QTest::addColumn<QString>("gestures");
    QTest::newRow("number") << false << "0.250"
                            << "-0.75" << int(Qt::Key_Return) << -0.75f << "1 1 0";
    QTest::newRow("percent") << true << "25.0%"
                             << "50" << int(Qt::Key_Enter) << 0.5f << "1 1 0";
    QTest::newRow("percent sign") << false << "0.250"
                                  << "10%" << int(Qt::Key_Return) << 0.1f << "1 1 0";
    QTest::newRow("esc") << false << "0.250"
                         << "0.9" << int(Qt::Key_Escape) << 0.25f << "1 0 1";
    // Text that is no finite float is refused: the edit ends as cancelled.
    for (const char* refused : {"abc", "nan", "-inf", "1e999", "1e39"})
        QTest::newRow(refused) << false << "0.250" << refused << int(Qt::Key_Return) << 0.25f
                               << "1 0 1";
}

void TestRkSlider::typedText()
{
    QFETCH(bool, percent);
    QFETCH(QString, shown);
    QFETCH(QString, typed);
    QFETCH(int, key);
    QFETCH(float, expected);
    QFETCH(QString, gestures);
    slider->setDisplayAsPercent(percent);
    Gestures spy(slider);
    QTest::mouseClick(slider, Qt::LeftButton, {}, slider->calcTextRect().center());
    auto* editor = slider->findChild<QLineEdit*>();
    QVERIFY(editor && editor->isVisible());
    QCOMPARE(editor->text(), shown);
    QCOMPARE(editor->geometry(), slider->calcEditRect());
    QCOMPARE(spy.counts(), QStringLiteral("1 0 0"));
    QTest::keyClicks(editor, typed);
    QTest::keyClick(editor, Qt::Key(key));
    QVERIFY(!editor->isVisible());
    QCOMPARE(slider->getValue(), expected);
    QCOMPARE(spy.counts(), gestures);

    // Not editable: a click on the text opens nothing.
    slider->setTextEditable(false);
    QTest::mouseClick(slider, Qt::LeftButton, {}, slider->calcTextRect().center());
    QVERIFY(!editor->isVisible());
    QCOMPARE(spy.counts(), gestures);
}

void TestRkSlider::clampedLimitsHold()
{
    slider->setClamped(true);
    slider->setMinMax(0, 1);
    drag(slider, slider->calcSliderRect().center(), 120, Qt::ControlModifier);
    QCOMPARE(slider->getValue(), 1.0f);
    // Going back counts from the limit, not from where the pointer overshot.
    drag(slider, slider->calcSliderRect().center(), -10);
    QCOMPARE(slider->getValue(), 0.9f);
    slider->setFocus();
    for (int i = 0; i < 12; ++i)
        QTest::keyClick(slider, Qt::Key_Down, Qt::ControlModifier);
    QCOMPARE(slider->getValue(), 0.0f);
    slider->setValue(7);
    QCOMPARE(slider->getValue(), 1.0f);
    slider->setValue(std::numeric_limits<float>::quiet_NaN());
    slider->setValue(-std::numeric_limits<float>::infinity());
    QCOMPARE(slider->getValue(), 1.0f);
    QCOMPARE(slider->getValueText(), QStringLiteral("1.000"));
    slider->setDisplayAsPercent(true);
    slider->setValue(0.5f);
    QCOMPARE(slider->getValueText(), QStringLiteral("50.0%"));
}

void TestRkSlider::intSliderStepsWhole()
{
    auto* ints = showInWindow(new RkIntSlider(nullptr, QStringLiteral("ints")));
    ints->setMinMax(0, 10);
    ints->setClamped(true);
    ints->setValue(3);
    QSignalSpy values(ints, &RkIntSlider::valueChanged);
    Gestures gestures(ints);
    drag(ints, ints->calcSliderRect().center(), 40); // 0.1 a pixel
    QCOMPARE(ints->getValue(), 7);
    ints->setFocus();
    QTest::keyClick(ints, Qt::Key_Right, Qt::ShiftModifier); // at least a whole step
    QCOMPARE(ints->getValue(), 8);
    QTest::mouseClick(ints, Qt::LeftButton, {}, ints->calcTextRect().center());
    auto* editor = ints->findChild<QLineEdit*>();
    QVERIFY(editor);
    QTest::keyClicks(editor, QStringLiteral("99"));
    QTest::keyClick(editor, Qt::Key_Return);
    QCOMPARE(ints->getValue(), 10);
    QCOMPARE(values.last().at(0).toInt(), 10);
    QCOMPARE(gestures.counts(), QStringLiteral("3 3 0"));
}

void TestRkSlider::overriddenRectsDriveHitTesting()
{
    auto* row = showInWindow(new TextLeftSlider(nullptr, QStringLiteral("row")));
    row->setValue(0.5f);
    Gestures gestures(row);
    // Where the default layout has its text, this layout has bar: a click opens nothing.
    QTest::mouseClick(row, Qt::LeftButton, {}, QPoint(row->width() - 5, 10));
    auto* editor = row->findChild<QLineEdit*>();
    QVERIFY(!editor || !editor->isVisible());
    QCOMPARE(gestures.counts(), QStringLiteral("0 0 0"));
    // The overridden text rectangle opens the editor there.
    QTest::mouseClick(row, Qt::LeftButton, {}, QPoint(30, 10));
    editor = row->findChild<QLineEdit*>();
    QVERIFY(editor && editor->isVisible());
    QCOMPARE(editor->geometry(), QRect(0, 0, 60, row->height()));
    QTest::keyClick(editor, Qt::Key_Escape);
    // And the bar drags where it now is.
    drag(row, QPoint(120, 10), 20);
    QCOMPARE(row->getValue(), 0.7f);
    QCOMPARE(gestures.counts(), QStringLiteral("2 1 1"));
    // Nothing outside the two rectangles is taken: the press goes on to the parent.
    QMouseEvent press(QEvent::MouseButtonPress, QPoint(65, 10), row->mapToGlobal(QPoint(65, 10)),
                      Qt::LeftButton, Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(row, &press);
    QVERIFY(!press.isAccepted());
}

RK_TEST_MAIN(TestRkSlider)
#include "tst_rkslider.moc"
