#pragma once

#include "rkcoreglobal.h"

#include <QWidget>

#include <memory>

// A thin grip bar between two areas that the user drags to share the room between them. A
// horizontal bar lies between an area above and one below and is dragged up and down; a vertical
// bar is dragged sideways. The bar only reports: whoever owns the areas resizes them.
//
// With the toggle bar enabled, a click without a drag asks to fold or unfold the area (the bar
// does not know which it is); a press must then travel the start-drag distance before it drags.
class RKCORE_EXPORT RkDividerBar : public QWidget
{
    Q_OBJECT
public:
    enum BarStyle {
        PlainBar = 0,      // a flat bar with a centre line
        GripBar = 1,       // a flat bar with a dotted grip in its middle
        GripToggleBar = 2, // the grip split by a small toggle button (shown with the toggle bar)
    };

    RkDividerBar(QWidget* parent, Qt::Orientation orientation, const QString& name,
                 BarStyle style = GripBar);
    ~RkDividerBar() override;

    Qt::Orientation orientation() const;
    BarStyle barStyle() const;

    void enableToggleBar(bool enable);
    bool isToggleBarEnabled() const;

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

Q_SIGNALS:
    // Pixels moved across the bar since the last emission (down or right is positive); the
    // deltas of one drag add up to the distance from the press to the release.
    void moved(int delta);
    // A click on the bar without a drag, or on its toggle button, with the toggle bar enabled.
    void toggleBarActivated();

protected:
    void paintEvent(QPaintEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;

private:
    struct Private;
    std::unique_ptr<Private> d;
};
