#include "widgets/rkslider.h"

#include <QApplication>
#include <QFocusEvent>
#include <QHash>
#include <QKeyEvent>
#include <QLineEdit>
#include <QMouseEvent>
#include <QPainter>
#include <QStyle>
#include <QWheelEvent>

#include <cmath>

namespace
{

enum Gesture { NoGesture, Pressed, Dragging, KeySteps, TextEdit };

// Drag and key steps: Shift for fine work, Ctrl for big moves.
double modifierFactor(Qt::KeyboardModifiers modifiers)
{
    if (modifiers & Qt::ShiftModifier)
        return 0.1;
    if (modifiers & Qt::ControlModifier)
        return 10.0;
    return 1.0;
}

bool isStepKey(int key)
{
    return key == Qt::Key_Left || key == Qt::Key_Right || key == Qt::Key_Up ||
           key == Qt::Key_Down || key == Qt::Key_Home;
}

} // namespace

struct RkSlider::Private {
    QString label;
    bool textVisible = true;
    bool textEditable = true;
    bool clamped = false;
    bool selected = false;
    bool mixed = false;
    bool barVisible = true;
    double sensitivity = 0.01;
    double value = 0.0;
    double defaultValue = 0.0;
    double min = 0.0;
    double max = 1.0;

    // The layout, as the calc operations last gave it.
    bool rectsValid = false;
    QRect sliderRect, textRect, editRect, labelRect;
    QSize minSize;
    QHash<QString, int> textWidths; // in the current font

    int gesture = NoGesture;
    double startValue = 0.0; // the value when the gesture began, put back by a cancel
    QPoint pressPos;
    int lastX = 0;
    // The drag's own running value: unrounded, so slow drags of an integer slider add up.
    double dragValue = 0.0;
    QLineEdit* editor = nullptr; // child of the slider, made on first use and kept
    QString editorStartText;
};

RkSlider::RkSlider(QWidget* parent, const QString& text)
    : QWidget(parent), d(std::make_unique<Private>())
{
    setObjectName(text);
    setFocusPolicy(Qt::StrongFocus);
    setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Fixed);
}

RkSlider::~RkSlider() = default;

QString RkSlider::getLabel() const
{
    return d->label;
}

bool RkSlider::showingLabel() const
{
    return !d->label.isEmpty();
}

void RkSlider::setLabel(const QString& label)
{
    if (label == d->label)
        return;
    d->label = label;
    updateRect();
}

bool RkSlider::isTextVisible() const
{
    return d->textVisible;
}

void RkSlider::setTextVisible(bool visible)
{
    if (visible == d->textVisible)
        return;
    d->textVisible = visible;
    updateRect();
}

bool RkSlider::isTextEditable() const
{
    return d->textEditable;
}

void RkSlider::setTextEditable(bool editable)
{
    d->textEditable = editable;
    if (!editable && d->gesture == TextEdit)
        closeEditor(false);
}

bool RkSlider::isClamped() const
{
    return d->clamped;
}

void RkSlider::setClamped(bool clamped)
{
    if (clamped == d->clamped)
        return;
    d->clamped = clamped;
    if (clamped)
        setSliderValue(d->value);
}

float RkSlider::getSensitivity() const
{
    return float(d->sensitivity);
}

void RkSlider::setSensitivity(float sensitivity)
{
    if (std::isfinite(sensitivity) && sensitivity > 0)
        d->sensitivity = sensitivity;
}

bool RkSlider::isSelected() const
{
    return d->selected;
}

void RkSlider::setSelected(bool selected)
{
    if (selected == d->selected)
        return;
    d->selected = selected;
    update();
}

bool RkSlider::isMixed() const
{
    return d->mixed;
}

void RkSlider::setMixed(bool mixed)
{
    if (mixed == d->mixed)
        return;
    d->mixed = mixed;
    update();
}

bool RkSlider::isBarVisible() const
{
    return d->barVisible;
}

void RkSlider::setBarVisible(bool visible)
{
    if (visible == d->barVisible)
        return;
    d->barVisible = visible;
    update();
}

bool RkSlider::isEditing() const
{
    return d->gesture != NoGesture && d->gesture != Pressed;
}

QString RkSlider::getValueText() const
{
    return formatValue(d->value);
}

double RkSlider::sliderValue() const
{
    return d->value;
}

bool RkSlider::setSliderValue(double value)
{
    if (!std::isfinite(value))
        return false;
    if (d->clamped)
        value = qBound(d->min, value, d->max);
    value = roundValue(value);
    if (!std::isfinite(value))
        return false;
    if (value == d->value)
        return true;
    d->value = value;
    update();
    sliderValueChanged();
    return true;
}

double RkSlider::sliderMin() const
{
    return d->min;
}

double RkSlider::sliderMax() const
{
    return d->max;
}

void RkSlider::setSliderMinMax(double min, double max)
{
    if (!std::isfinite(min) || !std::isfinite(max) || min > max)
        return;
    d->min = min;
    d->max = max;
    if (d->clamped)
        setSliderValue(d->value);
    update();
}

double RkSlider::sliderDefaultValue() const
{
    return d->defaultValue;
}

void RkSlider::setSliderDefaultValue(double value)
{
    if (std::isfinite(value))
        d->defaultValue = value;
}

double RkSlider::minimumStep() const
{
    return 0.0;
}

void RkSlider::updateRect()
{
    // The calc operations run when a rectangle is next needed, so setters that change the layout
    // one after the other cost one computation.
    d->rectsValid = false;
    if (d->gesture == TextEdit)
        ensureRects();
    updateGeometry();
    update();
}

void RkSlider::ensureRects()
{
    if (d->rectsValid)
        return;
    d->rectsValid = true;
    d->sliderRect = calcSliderRect();
    d->textRect = calcTextRect();
    d->editRect = calcEditRect();
    d->labelRect = calcLabelRect();
    d->minSize = calcMinSize();
    if (d->editor && d->gesture == TextEdit)
        d->editor->setGeometry(d->editRect);
}

int RkSlider::textWidth(const QString& text)
{
    // Shaping text is the dearest part of a layout; labels and value texts come back often.
    auto it = d->textWidths.constFind(text);
    if (it != d->textWidths.constEnd())
        return *it;
    if (d->textWidths.size() >= 64)
        d->textWidths.clear();
    const int width = fontMetrics().horizontalAdvance(text);
    d->textWidths.insert(text, width);
    return width;
}

QSize RkSlider::sizeHint() const
{
    // The calc operations are the layout's only source; they may be overridden, so not const.
    const_cast<RkSlider*>(this)->ensureRects();
    return d->minSize;
}

QSize RkSlider::minimumSizeHint() const
{
    return sizeHint();
}

// Default layout: label on the left and value text on the right in a top row of one text line,
// the bar under them across the whole width. Without label and text the bar is centred.
QSize RkSlider::calcMinSize()
{
    const int m = style()->pixelMetric(QStyle::PM_CustomBase);
    const int t = style()->pixelMetric(QStyle::PM_SliderThickness);
    const QFontMetrics fm = fontMetrics();
    int width = 0;
    if (showingLabel())
        width += textWidth(d->label) + m;
    if (isTextVisible())
        width += textWidth(widestValueText());
    const bool topRow = showingLabel() || isTextVisible();
    const int height = (topRow ? fm.height() + m / 2 : 0) + t;
    return QSize(qMax(width, 3 * t), height);
}

QRect RkSlider::calcSliderRect()
{
    const QRect r = rect();
    const int m = style()->pixelMetric(QStyle::PM_CustomBase);
    const int t = style()->pixelMetric(QStyle::PM_SliderThickness);
    if (!showingLabel() && !isTextVisible())
        return QRect(r.left(), r.center().y() - t / 2, r.width(), t);
    return QRect(r.left(), r.top() + fontMetrics().height() + m / 2, r.width(), t);
}

QRect RkSlider::calcTextRect()
{
    if (!isTextVisible())
        return QRect();
    const QRect r = rect();
    const int w = qMin(r.width(), textWidth(widestValueText()));
    return QRect(r.right() - w + 1, r.top(), w, fontMetrics().height());
}

QRect RkSlider::calcEditRect()
{
    return calcTextRect();
}

QRect RkSlider::calcLabelRect()
{
    if (!showingLabel())
        return QRect();
    const QRect r = rect();
    const int m = style()->pixelMetric(QStyle::PM_CustomBase);
    int w = r.width();
    if (isTextVisible())
        w -= textWidth(widestValueText()) + m;
    return QRect(r.left(), r.top(), qMax(w, 0), fontMetrics().height());
}

bool RkSlider::hitsValue(const QPoint& pos)
{
    ensureRects();
    return d->sliderRect.contains(pos) || (d->textVisible && d->textRect.contains(pos));
}

void RkSlider::beginGesture(int kind)
{
    d->gesture = kind;
    d->startValue = d->value;
    update();
    Q_EMIT editStart();
}

void RkSlider::finishGesture()
{
    d->gesture = NoGesture;
    update();
    Q_EMIT editEnd();
}

void RkSlider::cancelGesture()
{
    d->gesture = NoGesture;
    setSliderValue(d->startValue);
    update();
    Q_EMIT editCancelled();
}

void RkSlider::stepBy(double steps, Qt::KeyboardModifiers modifiers)
{
    double delta = steps * d->sensitivity * modifierFactor(modifiers);
    if (std::abs(delta) < minimumStep())
        delta = std::copysign(minimumStep(), delta);
    setSliderValue(d->value + delta);
}

void RkSlider::mousePressEvent(QMouseEvent* event)
{
    // Other buttons, and presses beside the bar and the text, belong to the parent (a list
    // selects its rows by them).
    if (event->button() != Qt::LeftButton || !isEnabled() || !hitsValue(event->pos())) {
        event->ignore();
        return;
    }
    if (d->gesture == KeySteps)
        finishGesture();
    d->gesture = Pressed;
    d->pressPos = event->pos();
    d->lastX = event->pos().x();
    d->startValue = d->value;
    d->dragValue = d->value;
    event->accept();
}

void RkSlider::mouseMoveEvent(QMouseEvent* event)
{
    if (!(event->buttons() & Qt::LeftButton) || (d->gesture != Pressed && d->gesture != Dragging)) {
        event->ignore();
        return;
    }
    const int x = event->pos().x();
    if (d->gesture == Pressed) {
        if ((event->pos() - d->pressPos).manhattanLength() < QApplication::startDragDistance())
            return;
        beginGesture(Dragging);
        if (d->gesture != Dragging)
            return; // a receiver of editStart() ended it
        // The value follows the pointer from where the button went down.
        d->lastX = d->pressPos.x();
    }
    d->dragValue += (x - d->lastX) * d->sensitivity * modifierFactor(event->modifiers());
    d->lastX = x;
    if (d->clamped)
        d->dragValue = qBound(d->min, d->dragValue, d->max);
    setSliderValue(d->dragValue);
}

void RkSlider::mouseReleaseEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton) {
        event->ignore();
        return;
    }
    if (d->gesture == Dragging) {
        finishGesture();
    } else if (d->gesture == Pressed) {
        d->gesture = NoGesture;
        ensureRects();
        if (d->textVisible && d->textEditable && d->textRect.contains(event->pos()))
            openEditor();
    }
}

void RkSlider::wheelEvent(QWheelEvent* event)
{
    // Unfocused sliders let the wheel scroll the list they sit in.
    const int steps = event->angleDelta().y() / 120;
    if (!hasFocus() || d->gesture != NoGesture || steps == 0 || !isEnabled()) {
        event->ignore();
        return;
    }
    event->accept();
    beginGesture(KeySteps);
    stepBy(steps, event->modifiers());
    if (d->gesture == KeySteps)
        finishGesture();
}

bool RkSlider::event(QEvent* event)
{
    // A gesture keeps Esc, and a focused slider its keys, from the window's shortcuts.
    if (event->type() == QEvent::ShortcutOverride) {
        const int key = static_cast<QKeyEvent*>(event)->key();
        if ((key == Qt::Key_Escape && isEditing()) || isStepKey(key)) {
            event->accept();
            return true;
        }
    }
    return QWidget::event(event);
}

void RkSlider::keyPressEvent(QKeyEvent* event)
{
    const int key = event->key();
    if (key == Qt::Key_Escape && (d->gesture == Dragging || d->gesture == KeySteps)) {
        cancelGesture();
        return;
    }
    if (!isStepKey(key) || d->gesture == Pressed || d->gesture == Dragging) {
        QWidget::keyPressEvent(event);
        return;
    }
    // A held key makes one gesture of all its repeats.
    if (d->gesture == NoGesture)
        beginGesture(KeySteps);
    if (d->gesture != KeySteps)
        return;
    if (key == Qt::Key_Home)
        setSliderValue(d->defaultValue);
    else
        stepBy(key == Qt::Key_Left || key == Qt::Key_Down ? -1 : 1, event->modifiers());
}

void RkSlider::keyReleaseEvent(QKeyEvent* event)
{
    if (d->gesture == KeySteps && isStepKey(event->key()) && !event->isAutoRepeat()) {
        finishGesture();
        return;
    }
    QWidget::keyReleaseEvent(event);
}

void RkSlider::focusOutEvent(QFocusEvent* event)
{
    if (d->gesture == KeySteps)
        finishGesture();
    QWidget::focusOutEvent(event);
}

void RkSlider::finishEditing()
{
    if (d->gesture == TextEdit)
        closeEditor(true);
    else if (d->gesture == Dragging || d->gesture == KeySteps)
        finishGesture();
    d->gesture = NoGesture;
}

void RkSlider::hideEvent(QHideEvent* event)
{
    // A gesture never outlives the slider's visibility.
    finishEditing();
    QWidget::hideEvent(event);
}

void RkSlider::changeEvent(QEvent* event)
{
    switch (event->type()) {
    case QEvent::EnabledChange:
        if (!isEnabled()) {
            if (d->gesture == TextEdit)
                closeEditor(false);
            else if (d->gesture == Dragging || d->gesture == KeySteps)
                finishGesture();
            d->gesture = NoGesture;
        }
        break;
    case QEvent::FontChange:
    case QEvent::StyleChange:
        d->textWidths.clear();
        updateRect();
        break;
    default:
        break;
    }
    QWidget::changeEvent(event);
}

void RkSlider::resizeEvent(QResizeEvent* event)
{
    updateRect();
    QWidget::resizeEvent(event);
}

void RkSlider::openEditor()
{
    if (!d->editor) {
        d->editor = new QLineEdit(this);
        d->editor->setFrame(false);
        d->editor->setObjectName(QStringLiteral("SliderEditor"));
        d->editor->installEventFilter(this);
    }
    beginGesture(TextEdit);
    if (d->gesture != TextEdit)
        return;
    d->editorStartText = getValueText();
    d->editor->setText(d->editorStartText);
    d->editor->setGeometry(d->editRect);
    d->editor->selectAll();
    d->editor->show();
    d->editor->setFocus(Qt::OtherFocusReason);
}

void RkSlider::closeEditor(bool commit)
{
    if (d->gesture != TextEdit)
        return;
    const QString text = d->editor->text();
    // Out of the edit before hiding: the focused editor's focus-out must not close it again.
    d->gesture = NoGesture;
    const bool hadFocus = d->editor->hasFocus();
    d->editor->hide();
    if (hadFocus)
        setFocus(Qt::OtherFocusReason);
    // Text the user left as it was changes nothing, not even by the rounding of the display.
    double value = 0.0;
    if (commit &&
        (text == d->editorStartText || (parseValue(text, &value) && setSliderValue(value))))
        finishGesture();
    else
        cancelGesture();
}

bool RkSlider::eventFilter(QObject* watched, QEvent* event)
{
    if (watched != d->editor || d->gesture != TextEdit)
        return QWidget::eventFilter(watched, event);
    switch (event->type()) {
    case QEvent::ShortcutOverride: {
        const int key = static_cast<QKeyEvent*>(event)->key();
        if (key == Qt::Key_Escape || key == Qt::Key_Return || key == Qt::Key_Enter)
            event->accept();
        break;
    }
    case QEvent::KeyPress: {
        // Enter and Esc end the edit here, so they never reach a dialog's default buttons.
        const int key = static_cast<QKeyEvent*>(event)->key();
        if (key == Qt::Key_Return || key == Qt::Key_Enter || key == Qt::Key_Escape) {
            closeEditor(key != Qt::Key_Escape);
            return true;
        }
        break;
    }
    case QEvent::FocusOut:
        // Clicking elsewhere commits; the editor's own context menu does not.
        if (static_cast<QFocusEvent*>(event)->reason() != Qt::PopupFocusReason)
            closeEditor(true);
        break;
    default:
        break;
    }
    return QWidget::eventFilter(watched, event);
}

void RkSlider::paintEvent(QPaintEvent*)
{
    ensureRects();
    QPainter p(this);
    const QPalette& pal = palette();
    const QPalette::ColorGroup group = !isEnabled()       ? QPalette::Disabled
                                       : isActiveWindow() ? QPalette::Active
                                                          : QPalette::Inactive;
    if (d->selected)
        p.fillRect(rect(), pal.color(group, QPalette::Highlight));
    const QColor ink =
        pal.color(group, d->selected ? QPalette::HighlightedText : QPalette::WindowText);

    if (showingLabel() && !d->labelRect.isEmpty()) {
        p.setPen(ink);
        p.drawText(d->labelRect, Qt::AlignLeft | Qt::AlignVCenter,
                   fontMetrics().elidedText(d->label, Qt::ElideRight, d->labelRect.width()));
    }

    if ((d->barVisible || isEditing()) && !d->sliderRect.isEmpty()) {
        const QRect bar = d->sliderRect.adjusted(0, 0, -1, -1);
        p.setPen(pal.color(group, QPalette::Mid));
        p.setBrush(pal.color(group, QPalette::Base));
        p.drawRect(bar);
        // The fill runs from zero (or the nearer end) to the value.
        const double span = d->max - d->min;
        auto toX = [&](double v) {
            const double f = span > 0 ? (qBound(d->min, v, d->max) - d->min) / span : 0.0;
            return bar.left() + 1 + int(std::lround(f * (bar.width() - 1)));
        };
        const int x0 = toX(0.0), x1 = toX(d->value);
        const QRect fill(QPoint(qMin(x0, x1), bar.top() + 1), QPoint(qMax(x0, x1), bar.bottom()));
        p.fillRect(fill.adjusted(0, 0, -1, 0),
                   pal.color(group, d->selected ? QPalette::HighlightedText : QPalette::Highlight));
    }

    if (d->textVisible && d->gesture != TextEdit && !d->textRect.isEmpty()) {
        QFont font = p.font();
        font.setItalic(d->mixed);
        p.setFont(font);
        p.setPen(ink);
        p.drawText(d->textRect, Qt::AlignRight | Qt::AlignVCenter, getValueText());
    }
}
