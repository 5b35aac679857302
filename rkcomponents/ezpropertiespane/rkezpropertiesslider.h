#pragma once

#include <QWidget>

#include <memory>

class RkEzCompressedSlider;
class RkFloatProperty;

// One row of the shape pane's property list: the property's name on the left, a compressed
// slider on the right. Editing and the hover preview over the name follow the tile's rules
// (RkEzPropertiesControl): each slider gesture is one undo entry named after the property, a
// preview is always taken back. A double-click on the name opens the property's options dialog.
//
// The property is watched, not owned: once it is deleted the row drops its hold, stops editing
// and shows nothing.
class RkEzPropertiesSlider : public QWidget
{
    Q_OBJECT
public:
    RkEzPropertiesSlider(RkFloatProperty* property, QWidget* parent, QWidget* owner);
    ~RkEzPropertiesSlider() override;

    QWidget* getOwner() const;
    // Null once the property has been deleted.
    RkFloatProperty* getProperty() const;
    RkEzCompressedSlider* getSlider() const;

    // Width of the name column.
    void setLabelWidth(int width);
    // Width the whole label needs in the name's font.
    int labelTextWidth() const;

    void beginPreview();
    void endPreview();
    bool isPreviewing() const;

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

protected Q_SLOTS:
    void editStart();
    void editEnd();
    void editCancelled();
    void sliderValueChanged(float value);
    void currentValueChanged();

private Q_SLOTS:
    void updateInternalSlider();

private:
    void showLabel();
    void propertyDestroyed();

    struct Private;
    std::unique_ptr<Private> d;
};
