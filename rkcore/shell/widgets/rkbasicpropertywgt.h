#pragma once

#include "widgets/rkpropertywgt.h"

class RkSlider;

// A property widget in a row of its own: the editing control sits in the widget's horizontal
// layout. It runs the undo protocol of an edit: everything one gesture changes, on every property
// the widget holds, becomes one undo entry named after the label, and a cancelled gesture leaves
// neither a change nor an entry.
class RKCORE_EXPORT RkBasicPropertyWgt : public RkPropertyWgt
{
    Q_OBJECT
public:
    RkBasicPropertyWgt(QWidget* parent, const QString& name);
    ~RkBasicPropertyWgt() override;

    void setSelected(bool selected) override;
    // A gesture in progress ends first, keeping what it did, as when the widget is hidden.
    void removeAllProperties() override;

    // Lets the user edit the options of the properties. False when the widget has no options or
    // the user changed nothing.
    virtual bool doOptionsDialog();

protected:
    // Gives the attached slider the first property's label and the group's mixed and editable
    // state; the typed widgets set limits and value before calling it.
    void updateFromProperties() override;
    void mouseDoubleClickEvent(QMouseEvent* event) override;
    void enterEvent(QEvent* event) override;
    void leaveEvent(QEvent* event) override;

    // The undo protocol of one gesture.
    void beginPropertyEdit();
    void finishPropertyEdit();
    void cancelPropertyEdit();
    bool isPropertyEditOpen() const;
    // The first property's label, or "Unnamed".
    QString undoCaption() const;

    // Gives the widget its slider: the slider's gestures run the undo protocol, and it follows
    // the widget's selection and the mouse-over switch.
    void attachSlider(RkSlider* slider);
    // With the switch on, the slider's bar shows only while the pointer is over the widget.
    void setSliderBarOnHover(bool on);
    bool isSliderBarOnHover() const;

private:
    void updateSliderBar();

    struct Private;
    std::unique_ptr<Private> d;
};
