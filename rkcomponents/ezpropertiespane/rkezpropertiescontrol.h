#pragma once

#include <QImage>
#include <QWidget>

#include <memory>

class RkEzIconGridWgt;
class RkFloatProperty;
class RkFloatSlider;

// The tile of one morph (a float property) in the shape pane's image view: a thumbnail with the
// value as a whole percentage, and the property's label. A slider covers the label while the
// pointer is on the label strip; each of its gestures is one undo entry named after the property.
// Resting on the thumbnail previews the morph at full strength inside an undo hold that is always
// cancelled. Pressing on the tile and dragging starts a drag with the tile as its source.
//
// The property is watched, not owned: once it is deleted the tile drops its hold, stops editing
// and shows nothing.
class RkEzPropertiesControl : public QWidget
{
    Q_OBJECT
public:
    // The grid that owns the tile may be null. The tile reads nothing from it; it only keeps it
    // for the grid's thumbnail renderer (getGrid()).
    RkEzPropertiesControl(RkFloatProperty* property, QWidget* parent, RkEzIconGridWgt* grid);
    ~RkEzPropertiesControl() override;

    RkEzIconGridWgt* getGrid() const;
    // Null once the property has been deleted.
    RkFloatProperty* getProperty() const;

    // The preview protocol of the hover and of the thumbnail renderer. A morph already at half
    // strength or more, a playing scene, or an open hold of this tile or of anyone else's edit
    // (for the hover) start no preview.
    void beginPreview();
    void endPreview();
    bool isPreviewing() const;

    void setImage(const QImage& image);
    QImage getImage() const;
    // The thumbnail area's size: thumbnails are rendered at it.
    QSize getImageSize() const;

    // The dragger's protocol: remember the value, then mix towards it by the distance of the
    // dragger's point from the tile.
    void takeValueSnapshot();
    bool differsFromSnapshot() const;
    void mixAt(int x, int y);

    void setHighlighted(bool on);

    // For the thumbnail renderer, which stops a hover preview for a render and resumes it after.
    bool isPointerOverImage() const;
    void setPointerOverImage(bool on);
    RkFloatSlider* getSlider() const;

    QSize sizeHint() const override;
    int heightForWidth(int width) const override;

public Q_SLOTS:
    void currentValueChanged();

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void enterEvent(QEvent* event) override;
    void leaveEvent(QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

protected Q_SLOTS:
    void editStart();
    void editEnd();
    void editCancelled();
    void sliderValueChanged(float value);

private Q_SLOTS:
    void updateInternalSlider();

private:
    void propertyDestroyed();

    struct Private;
    std::unique_ptr<Private> d;
};
