#pragma once

#include "rkcoreglobal.h"

#include <QWidget>

#include <memory>

// A value slider: a label, a bar and the value as text. Dragging sideways changes the value by the
// sensitivity per pixel (Shift finer, Ctrl coarser), a click on the value text edits it in place,
// arrow keys step, Home returns to the default and the wheel steps while the slider has focus.
// Every user gesture is bracketed by editStart() and exactly one of editEnd() or editCancelled();
// the value changes of a gesture come in between. Esc cancels a gesture and puts the value back.
//
// The layout comes from the calc operations alone: painting and hit-testing read only the
// rectangles they return (cached; updateRect() and a resize have them computed again), so a
// subclass lays the slider out differently by overriding them.
//
// The base class does not know the value's type: RkFloatSlider and RkIntSlider give it one.
class RKCORE_EXPORT RkSlider : public QWidget
{
    Q_OBJECT
public:
    // The text names the widget (its object name); the label is set with setLabel().
    RkSlider(QWidget* parent, const QString& text);
    ~RkSlider() override;

    QString getLabel() const;
    // True when there is a label to show.
    bool showingLabel() const;

    bool isTextVisible() const;
    void setTextVisible(bool visible);
    // Whether a click on the value text opens the editor.
    bool isTextEditable() const;
    void setTextEditable(bool editable);

    // A clamped slider keeps its value within [min, max]; an unclamped one only fills its bar by
    // them.
    bool isClamped() const;
    void setClamped(bool clamped);
    // Value change per pixel of drag and per arrow key.
    float getSensitivity() const;
    void setSensitivity(float sensitivity);

    // Drawn as chosen: the background in the palette's highlight.
    bool isSelected() const;
    void setSelected(bool selected);
    // The value stands for several values that differ; its text is shown in italics.
    bool isMixed() const;
    void setMixed(bool mixed);
    // Whether the bar is drawn while no gesture runs (a gesture always shows it).
    bool isBarVisible() const;
    void setBarVisible(bool visible);

    // True between editStart() and the end or cancel of the gesture.
    bool isEditing() const;
    // Ends a gesture in progress as hiding the slider does: what was done so far is kept.
    void finishEditing();
    // The value as the slider shows it.
    QString getValueText() const;

    // Has the cached rectangles and the minimum size computed again from the calc operations
    // (when they are next needed).
    void updateRect();

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

protected:
    bool event(QEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void wheelEvent(QWheelEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void keyReleaseEvent(QKeyEvent* event) override;
    void focusOutEvent(QFocusEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void hideEvent(QHideEvent* event) override;
    void changeEvent(QEvent* event) override;
    bool eventFilter(QObject* watched, QEvent* event) override;

public:
    virtual QSize calcMinSize();
    virtual QRect calcSliderRect();
    virtual QRect calcTextRect();
    virtual QRect calcEditRect();
    virtual QRect calcLabelRect();

public Q_SLOTS:
    virtual void setLabel(const QString& label);

Q_SIGNALS:
    void editStart();
    void editEnd();
    void editCancelled();

protected:
    // The value in the type-neutral form the base class works with. setSliderValue() refuses a
    // value that is not finite once rounded (answers false), clamps a clamped slider's value and
    // calls sliderValueChanged() when the value changed.
    double sliderValue() const;
    bool setSliderValue(double value);
    double sliderMin() const;
    double sliderMax() const;
    void setSliderMinMax(double min, double max);
    double sliderDefaultValue() const;
    void setSliderDefaultValue(double value);

    // What the value type decides: how a value is rounded to the type, shown and read back, and
    // how a change is announced.
    virtual double roundValue(double value) const = 0;
    virtual QString formatValue(double value) const = 0;
    // False when the text is not a value of the type.
    virtual bool parseValue(const QString& text, double* value) const = 0;
    virtual void sliderValueChanged() = 0;
    // The widest text the value usually needs, for the default layout.
    virtual QString widestValueText() const = 0;
    // The smallest step a key can make.
    virtual double minimumStep() const;

    // The width of a text in the slider's font, remembered: for calc operations, which run on
    // every layout change.
    int textWidth(const QString& text);

private:
    void ensureRects();
    bool hitsValue(const QPoint& pos);
    void beginGesture(int kind);
    void finishGesture();
    void cancelGesture();
    void stepBy(double steps, Qt::KeyboardModifiers modifiers);
    void openEditor();
    void closeEditor(bool commit);

    struct Private;
    std::unique_ptr<Private> d;
};
