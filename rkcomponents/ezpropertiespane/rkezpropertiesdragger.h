#pragma once

#include <QWidget>

#include <memory>

class RkEzIconGridWgt;

// The "Drag To Mix Morphs" handle in the middle of a page's tiles. While it is dragged, every
// tile it comes close to has its morph raised by the closeness, on top of the value the morph had
// when the drag began; on release the handle jumps back and the changes are one undo entry
// "Mixer Drag". Its "Undo" button shows while such an entry is the one to undo.
//
// The mixing itself is the grid's: it snapshots, mixes and compares its tiles and knows where the
// handle may go.
class RkEzPropertiesDragger : public QWidget
{
    Q_OBJECT
public:
    // The grid is watched, not owned (it is normally the parent too); without it a drag moves
    // nothing and mixes nothing.
    RkEzPropertiesDragger(QWidget* parent, RkEzIconGridWgt* grid);
    // A drag still running ends here as a release would, so no undo hold stays open.
    ~RkEzPropertiesDragger() override;

    // Frame and arrows are painted only when set; takes effect at the next paint.
    void setHandleVisible(bool visible);

    bool isDragging() const;
    // Ends a running drag as a release would; nothing when none runs.
    void endDrag();

protected Q_SLOTS:
    void undoCaptionChanged(const QString& caption);

protected:
    void mousePressEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

private:
    void startDrag(const QPoint& globalPos);

    struct Private;
    std::unique_ptr<Private> d;
};
