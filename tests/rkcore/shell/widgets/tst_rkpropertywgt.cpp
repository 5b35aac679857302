#include "app/rkapp.h"
#include "plugin/rkclassfactory.h"
#include "properties/rkboolproperty.h"
#include "properties/rkfloatproperty.h"
#include "properties/rkintproperty.h"
#include "rktestmain.h"
#include "undo/rkundostack.h"
#include "widgets/rkboolpropertywgt.h"
#include "widgets/rkfloatpropertywgt.h"
#include "widgets/rkfloatslider.h"
#include "widgets/rkintpropertywgt.h"
#include "widgets/rkintslider.h"

#include <QCheckBox>
#include <QDialog>
#include <QDialogButtonBox>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QTimer>
#include <QVBoxLayout>

#include <functional>

namespace
{

// The parent a list would be: it notes the presses its children leave to it.
class Parent : public QWidget
{
public:
    QList<Qt::MouseButton> presses;

protected:
    void mousePressEvent(QMouseEvent* event) override { presses.append(event->button()); }
};

// A move with the left button held.
void moveHeld(QWidget* w, QPoint to)
{
    QMouseEvent move(QEvent::MouseMove, to, w->mapToGlobal(to), Qt::NoButton, Qt::LeftButton,
                     Qt::NoModifier);
    QApplication::sendEvent(w, &move);
}

// A user's drag: press, two moves, and the release unless the test still holds the button.
void drag(QWidget* w, QPoint from, int dx, bool release = true)
{
    QTest::mousePress(w, Qt::LeftButton, {}, from);
    moveHeld(w, from + QPoint(dx / 2, 0));
    moveHeld(w, from + QPoint(dx, 0));
    if (release)
        QTest::mouseRelease(w, Qt::LeftButton, {}, from + QPoint(dx, 0));
}

// Runs the steps on the modal dialog once it is up, then closes it if the steps did not.
void onDialog(const std::function<void(QDialog*)>& steps)
{
    QTimer::singleShot(0, [steps] {
        auto* dialog = qobject_cast<QDialog*>(QApplication::activeModalWidget());
        if (!dialog)
            return;
        steps(dialog);
        if (dialog->isVisible())
            dialog->reject();
    });
}

void fill(QDialog* dialog, const char* field, const QString& text)
{
    auto* edit = dialog->findChild<QLineEdit*>(QLatin1String(field));
    edit->clear();
    QTest::keyClicks(edit, text);
}

void press(QDialog* dialog, QDialogButtonBox::StandardButton which)
{
    QTest::mouseClick(dialog->findChild<QDialogButtonBox*>()->button(which), Qt::LeftButton);
}

} // namespace

class TestRkPropertyWgt : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init();
    void cleanup();
    void gestureSetsAllPropertiesInOneEntry();
    void escLeavesNoEntryAndNoChange();
    void destroyedPropertyDropsOut();
    void followsOnlyThePropertiesItHolds();
    void emptiedMidGestureKeepsWhatWasDone();
    void rightPressReachesTheParent();
    void selectionAndMouseOverBar();
    void boolWidgetTogglesAll();
    void intWidgetKeepsLimits();
    void optionsDialogValidatesAndAppliesOnce();
    void lockedPropertyRefusesTheUser();
    void factoriesMakeTheWidgets_data();
    void factoriesMakeTheWidgets();

private:
    std::unique_ptr<Parent> window;
    RkFloatPropertyWgt* widget = nullptr;
    RkFloatSlider* slider = nullptr;
    QList<RkFloatProperty*> props; // owned by the window's QObject children
};

void TestRkPropertyWgt::init()
{
    window = std::make_unique<Parent>();
    auto* layout = new QVBoxLayout(window.get());
    widget = new RkFloatPropertyWgt(window.get());
    layout->addWidget(widget);
    props.clear();
    for (float value : {0.1f, 0.2f, 0.3f}) {
        auto* p = new RkFloatProperty(QStringLiteral("bend"), QStringLiteral("Bend"), window.get());
        p->setValue(value);
        props.append(p);
        widget->addProperty(p);
    }
    slider = widget->findChild<RkFloatSlider*>();
    window->resize(300, 80);
    window->show();
    // Other tests' windows share the X server and may hold the activation; the widgets are driven
    // with events sent to them, which needs the window shown, not active.
    window->activateWindow();
    QVERIFY(QTest::qWaitForWindowExposed(window.get()));
    rkUndoStack->clear();
}

void TestRkPropertyWgt::cleanup()
{
    window.reset();
}

void TestRkPropertyWgt::gestureSetsAllPropertiesInOneEntry()
{
    QCOMPARE(widget->getFirstProperty(), props[0]);
    QCOMPARE(slider->getValueText(), QStringLiteral("0.100"));
    QCOMPARE(slider->getLabel(), QStringLiteral("Bend"));
    QVERIFY(slider->isMixed());

    drag(slider, slider->calcSliderRect().center(), 20);
    for (RkFloatProperty* p : props)
        QCOMPARE(p->getValue(), 0.3f);
    QVERIFY(!slider->isMixed());
    QCOMPARE(rkUndoStack->count(), 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Bend"));

    QTest::mouseClick(slider, Qt::LeftButton, {}, slider->calcTextRect().center());
    auto* editor = slider->findChild<QLineEdit*>();
    QTest::keyClicks(editor, QStringLiteral("0.75"));
    QTest::keyClick(editor, Qt::Key_Return);
    slider->setFocus();
    QTest::keyClick(slider, Qt::Key_Right);
    for (RkFloatProperty* p : props) {
        QCOMPARE(p->getValue(), 0.76f);
        QVERIFY(!p->isEditing());
    }
    QCOMPARE(rkUndoStack->count(), 3);

    for (int i = 0; i < 3; ++i)
        rkUndoStack->undo();
    QCOMPARE(props[0]->getValue(), 0.1f);
    QCOMPARE(props[2]->getValue(), 0.3f);
    QVERIFY(slider->isMixed());
}

void TestRkPropertyWgt::escLeavesNoEntryAndNoChange()
{
    drag(slider, slider->calcSliderRect().center(), 30, false);
    QCOMPARE(props[2]->getValue(), 0.4f);
    QTest::keyClick(slider, Qt::Key_Escape);
    QTest::mouseRelease(slider, Qt::LeftButton);
    QCOMPARE(props[0]->getValue(), 0.1f);
    QCOMPARE(props[1]->getValue(), 0.2f);
    QCOMPARE(props[2]->getValue(), 0.3f);
    QCOMPARE(rkUndoStack->count(), 0);
    QVERIFY(!rkUndoStack->canPushItems());
    QVERIFY(!props[1]->isEditing());
}

void TestRkPropertyWgt::destroyedPropertyDropsOut()
{
    delete props.takeFirst();
    QCOMPARE(widget->getFirstProperty(), props[0]);
    QCOMPARE(widget->getProperties().size(), 2);
    QCOMPARE(slider->getValueText(), QStringLiteral("0.200"));

    // Gone in the middle of a drag: the rest still make one entry.
    drag(slider, slider->calcSliderRect().center(), 20, false);
    delete props.takeFirst();
    moveHeld(slider, slider->calcSliderRect().center() + QPoint(20, 0));
    QTest::mouseRelease(slider, Qt::LeftButton);
    QCOMPARE(props[0]->getValue(), 0.4f);
    QCOMPARE(rkUndoStack->count(), 1);

    delete props.takeFirst();
    QVERIFY(!widget->getFirstProperty());
    QVERIFY(!slider->isEnabled());
    drag(slider, slider->calcSliderRect().center(), 20);
    QCOMPARE(rkUndoStack->count(), 1);
}

// Changes made elsewhere (undo, scripts, other widgets) show at once; a widget given other
// properties, as a pool does, no longer hears from the ones it had.
void TestRkPropertyWgt::followsOnlyThePropertiesItHolds()
{
    RkFloatProperty* bend = props[0];
    bend->setLabel(QStringLiteral("Bend Left"));
    QCOMPARE(slider->getLabel(), QStringLiteral("Bend Left"));
    bend->setMinMax(-2, 3);
    QCOMPARE(slider->getMin(), -2.0f);
    QCOMPARE(slider->getMax(), 3.0f);
    bend->setClamped(true);
    QVERIFY(slider->isClamped());
    bend->setDisplayAsPercent(true);
    QCOMPARE(slider->getValueText(), QStringLiteral("10.0%"));
    bend->setValue(0.5f);
    QVERIFY(slider->isMixed());
    QCOMPARE(slider->getValueText(), QStringLiteral("50.0%"));
    props[2]->setLocked(true);
    QVERIFY(!slider->isEnabled());

    widget->removeAllProperties();
    RkFloatProperty other(QStringLiteral("twist"), QStringLiteral("Twist"));
    other.setValue(0.75f);
    widget->addProperty(&other);
    QCOMPARE(slider->getLabel(), QStringLiteral("Twist"));
    QCOMPARE(slider->getValueText(), QStringLiteral("0.750"));
    QVERIFY(!slider->isMixed());
    QVERIFY(slider->isEnabled());
    for (RkFloatProperty* p : qAsConst(props)) {
        p->setLabel(QStringLiteral("Old"));
        p->setValue(0.9f);
        p->setDisplayAsPercent(false);
        p->setLocked(false);
    }
    QCOMPARE(slider->getLabel(), QStringLiteral("Twist"));
    QCOMPARE(slider->getValueText(), QStringLiteral("0.750"));
    other.setMinMax(0, 0.5f);
    QCOMPARE(slider->getMax(), 0.5f);
    widget->removeAllProperties();
}

// A pool empties a widget and gives it other properties while the user may still be at it: the
// gesture ends there, as if the widget had been hidden, and goes no further.
void TestRkPropertyWgt::emptiedMidGestureKeepsWhatWasDone()
{
    RkFloatProperty other(QStringLiteral("twist"), QStringLiteral("Twist"));
    other.setValue(0.5f);
    const QPoint from = slider->calcSliderRect().center();
    drag(slider, from, 20, false);
    widget->removeAllProperties();
    widget->addProperty(&other);
    moveHeld(slider, from + QPoint(60, 0));
    QTest::mouseRelease(slider, Qt::LeftButton, {}, from + QPoint(60, 0));
    for (RkFloatProperty* p : qAsConst(props)) {
        QCOMPARE(p->getValue(), 0.3f);
        QVERIFY(!p->isEditing());
    }
    QCOMPARE(other.getValue(), 0.5f);
    QCOMPARE(rkUndoStack->count(), 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Bend"));

    // Typed but not yet entered: the text counts, for the property it was typed for.
    QTest::mouseClick(slider, Qt::LeftButton, {}, slider->calcTextRect().center());
    auto* editor = slider->findChild<QLineEdit*>();
    QVERIFY(editor && editor->isVisible());
    QTest::keyClicks(editor, QStringLiteral("0.25"));
    widget->removeAllProperties();
    QVERIFY(!editor->isVisible());
    QCOMPARE(other.getValue(), 0.25f);
    QCOMPARE(rkUndoStack->count(), 2);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Twist"));
    QCOMPARE(props[0]->getValue(), 0.3f);
}

void TestRkPropertyWgt::rightPressReachesTheParent()
{
    QTest::mousePress(slider, Qt::RightButton, {}, slider->calcSliderRect().center());
    QTest::mousePress(widget, Qt::RightButton, {}, QPoint(1, 1));
    QTest::mousePress(slider, Qt::LeftButton, {}, slider->calcSliderRect().center());
    QTest::mouseRelease(slider, Qt::LeftButton);
    QTest::mousePress(widget, Qt::LeftButton, {}, QPoint(1, 1));
    QCOMPARE(window->presses, QList<Qt::MouseButton>({Qt::RightButton, Qt::RightButton}));
}

void TestRkPropertyWgt::selectionAndMouseOverBar()
{
    QCursor::setPos(window->geometry().bottomRight() + QPoint(100, 100)); // the pointer away
    QApplication::processEvents();
    const QColor highlight = widget->palette().color(QPalette::Active, QPalette::Highlight);
    QVERIFY(widget->grab().toImage().pixelColor(1, 1) != highlight);
    widget->setSelected(true);
    QVERIFY(widget->isSelected());
    QCOMPARE(widget->grab().toImage().pixelColor(1, 1), highlight);
    widget->setSelected(false);

    const QRect bar = slider->calcSliderRect();
    const QRect text = slider->calcTextRect();
    const QImage shown = slider->grab().toImage();
    widget->setIsMouseOverSlider(true);
    const QImage away = slider->grab().toImage();
    QVERIFY(shown.copy(bar) != away.copy(bar));
    QCOMPARE(shown.copy(text), away.copy(text));
    QEvent enter(QEvent::Enter);
    QApplication::sendEvent(widget, &enter);
    QCOMPARE(slider->grab().toImage().copy(bar), shown.copy(bar));
    QEvent leave(QEvent::Leave);
    QApplication::sendEvent(widget, &leave);
    QCOMPARE(slider->grab().toImage().copy(bar), away.copy(bar));
}

void TestRkPropertyWgt::boolWidgetTogglesAll()
{
    RkBoolPropertyWgt boolWidget;
    RkBoolProperty a(QStringLiteral("a"), QStringLiteral("Visible")), b(QStringLiteral("b"), {});
    a.setValue(true);
    boolWidget.addProperty(&a);
    boolWidget.addProperty(&b);
    boolWidget.addProperty(props[0]); // not an on/off property: refused
    QCOMPARE(boolWidget.getProperties().size(), 2);
    boolWidget.show();
    auto* box = boolWidget.findChild<QCheckBox*>();
    QCOMPARE(box->text(), QStringLiteral("Visible"));
    QCOMPARE(box->checkState(), Qt::PartiallyChecked);
    QTest::mouseClick(box, Qt::LeftButton);
    QVERIFY(a.getValue() && b.getValue());
    QCOMPARE(box->checkState(), Qt::Checked);
    QTest::mouseClick(box, Qt::LeftButton);
    QVERIFY(!a.getValue() && !b.getValue());
    QCOMPARE(rkUndoStack->count(), 2);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Visible"));
    rkUndoStack->undo();
    QVERIFY(a.getValue() && b.getValue());
}

void TestRkPropertyWgt::intWidgetKeepsLimits()
{
    RkIntPropertyWgt intWidget;
    RkIntProperty count(QStringLiteral("count"), QStringLiteral("Count"));
    count.setMinMax(0, 5);
    count.setClamped(true);
    count.setValue(4);
    intWidget.addProperty(&count);
    intWidget.resize(200, intWidget.sizeHint().height());
    intWidget.show();
    auto* ints = intWidget.findChild<RkIntSlider*>();
    drag(ints, ints->calcSliderRect().center(), 100);
    QCOMPARE(count.getValue(), 5);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Count"));
    count.setMinMax(0, 3);
    QCOMPARE(ints->getMax(), 3);
}

void TestRkPropertyWgt::optionsDialogValidatesAndAppliesOnce()
{
    QStringList errors;
    const auto errorText = [&errors](QDialog* dialog) {
        errors.append(dialog->findChild<QLabel*>(QStringLiteral("ErrorText"))->text());
    };
    onDialog([&](QDialog* dialog) {
        fill(dialog, "MinEdit", QStringLiteral("2"));
        fill(dialog, "MaxEdit", QStringLiteral("1"));
        press(dialog, QDialogButtonBox::Ok);
        errorText(dialog);
        fill(dialog, "MinEdit", QStringLiteral("abc"));
        press(dialog, QDialogButtonBox::Ok);
        errorText(dialog);
        fill(dialog, "MinEdit", QStringLiteral("0"));
        fill(dialog, "MaxEdit", QStringLiteral("1e999"));
        press(dialog, QDialogButtonBox::Ok);
        errorText(dialog);
        fill(dialog, "MaxEdit", QStringLiteral("0.25"));
        fill(dialog, "SensitivityEdit", QStringLiteral("nan"));
        press(dialog, QDialogButtonBox::Ok);
        errorText(dialog);
        QVERIFY(dialog->isVisible());
        fill(dialog, "SensitivityEdit", QStringLiteral("0.5"));
        fill(dialog, "LabelEdit", QStringLiteral("Bend More"));
        dialog->findChild<QCheckBox*>(QStringLiteral("ClampedCheck"))->setChecked(true);
        dialog->findChild<QCheckBox*>(QStringLiteral("PercentCheck"))->setChecked(true);
        dialog->findChild<QCheckBox*>(QStringLiteral("HiddenCheck"))->setChecked(true);
        press(dialog, QDialogButtonBox::Ok);
    });
    QVERIFY(widget->doOptionsDialog());
    QCOMPARE(errors.size(), 4);
    for (const QString& error : errors)
        QVERIFY2(!error.isEmpty(), "a refused field shows why");
    for (RkFloatProperty* p : props) {
        QCOMPARE(p->getLabel(), QStringLiteral("Bend More"));
        QCOMPARE(p->getMax(), 0.25f);
        QVERIFY(p->isClamped() && p->getDisplayAsPercent() && p->isHidden());
        QCOMPARE(p->getSensitivity(), 0.5f);
    }
    QCOMPARE(props[2]->getValue(), 0.25f); // clamped into the new limits
    QCOMPARE(slider->getValueText(), QStringLiteral("10.0%"));
    QCOMPARE(rkUndoStack->count(), 1);
    QCOMPARE(rkUndoStack->getUndoCaption(), QStringLiteral("Bend More"));
    // The one entry takes the definitions back with the clamped value, and brings them again.
    rkUndoStack->undo();
    for (RkFloatProperty* p : props) {
        QCOMPARE(p->getLabel(), QStringLiteral("Bend"));
        QVERIFY(!p->isClamped() && !p->getDisplayAsPercent() && !p->isHidden());
        QCOMPARE(p->getSensitivity(), 0.01f);
    }
    QCOMPARE(props[2]->getValue(), 0.3f);
    rkUndoStack->redo();
    QCOMPARE(props[1]->getLabel(), QStringLiteral("Bend More"));
    QCOMPARE(props[2]->getValue(), 0.25f);
    QVERIFY(props[0]->isHidden() && props[0]->getMax() == 0.25f);

    // Cancel changes nothing, whatever the fields say. A double-click on the label opens the
    // dialog; one on the value does not.
    bool opened = false;
    onDialog([&opened](QDialog* dialog) {
        opened = true;
        fill(dialog, "MinEdit", QStringLiteral("-5"));
        fill(dialog, "LabelEdit", QStringLiteral("Other"));
        press(dialog, QDialogButtonBox::Cancel);
    });
    QTest::mouseDClick(slider, Qt::LeftButton, {}, QPoint(4, 4));
    QVERIFY(opened);
    opened = false;
    onDialog([&opened](QDialog*) { opened = true; });
    QTest::mouseDClick(slider, Qt::LeftButton, {}, QPoint(slider->width() - 4, 4));
    QCoreApplication::processEvents();
    QVERIFY(!opened);
    QCOMPARE(props[0]->getLabel(), QStringLiteral("Bend More"));
    QCOMPARE(props[0]->getMin(), 0.0f);
    QCOMPARE(rkUndoStack->count(), 1);
}

void TestRkPropertyWgt::lockedPropertyRefusesTheUser()
{
    props[1]->setLocked(true);
    QVERIFY(!slider->isEnabled());
    QVERIFY(!widget->doOptionsDialog());
    QTest::keyClick(slider, Qt::Key_Right);
    QCOMPARE(props[0]->getValue(), 0.1f);
    QCOMPARE(rkUndoStack->count(), 0);
    props[1]->setLocked(false);
    QVERIFY(slider->isEnabled());
}

void TestRkPropertyWgt::factoriesMakeTheWidgets_data()
{
    QTest::addColumn<QString>("className");
    QTest::newRow("float") << RkFloatProperty(QString(), QString()).widgetClassName();
    QTest::newRow("int") << RkIntProperty(QString(), QString()).widgetClassName();
    QTest::newRow("bool") << RkBoolProperty(QString(), QString()).widgetClassName();
}

void TestRkPropertyWgt::factoriesMakeTheWidgets()
{
    QFETCH(QString, className);
    RkClassFactory* factory = RkApp::findClassFactory(className);
    QVERIFY2(factory, qPrintable(className));
    std::unique_ptr<QObject> made(factory->createInstance());
    QVERIFY(qobject_cast<RkBasicPropertyWgt*>(made.get()));
    QCOMPARE(QString::fromLatin1(made->metaObject()->className()), className);
}

RK_TEST_MAIN(TestRkPropertyWgt)
#include "tst_rkpropertywgt.moc"
