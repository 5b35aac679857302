#pragma once

#include <QWidget>

#include <memory>

class QLayout;
class RkFloatProperty;

// The "Drag To Mix Morphs" handle in the middle of a page's tiles. While it is dragged, every
// tile it comes close to has its morph raised by the closeness, on top of the value the morph had
// when the drag began; on release the handle jumps back and the changes are one undo entry
// "Mixer Drag". Its "Undo" button shows while such an entry is the one to undo.
//
// A tile is seen only as a widget beside the handle (same parent; its top-left corner and size
// count) and the morph it shows.
class RkEzPropertiesDragger : public QWidget
{
    Q_OBJECT
public:
    explicit RkEzPropertiesDragger(QWidget* parent);
    // A drag still running ends here as a release would, so no undo hold stays open.
    ~RkEzPropertiesDragger() override;

    // Frame and arrows are painted only when set; takes effect at the next paint.
    void setHandleVisible(bool visible);

    // The tiles in the grid's order. Both are watched, not owned: a tile or morph deleted during
    // a drag is skipped from then on.
    void addTile(QWidget* tile, RkFloatProperty* morph);
    void clearTiles();
    // The layout whose contents the handle stays in (the grid of tiles); without one, the
    // parent's contents.
    void setMixArea(QLayout* layout);

    // Where the handle's top-left corner may go: the mix area less the handle's own size,
    // widened to every tile's top-left corner.
    QRect draggerBounds() const;
    bool isDragging() const;

Q_SIGNALS:
    // A drag begins; the morphs' values are taken right after it, so a tile ends any preview
    // of its morph here.
    void mixStarting();

protected Q_SLOTS:
    void undoCaptionChanged(const QString& caption);

protected:
    void mousePressEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

private:
    void startDrag(const QPoint& globalPos);
    void endDrag();
    void mixTilesAt(const QPoint& handle);
    bool tileValuesChanged() const;

    struct Private;
    std::unique_ptr<Private> d;
};
