#pragma once

#include <QPoint>
#include <QPointer>
#include <QWidget>

class RkEzMixerControl;

// A mixer control on its page: the control's thumbnail centred on its point, reacting to the
// mouse only where the thumbnail is opaque. Dragging it with the left button re-places the
// control (no undo entry, no drive); its context menu deletes it. A control without a visible
// thumbnail shows an 85 by 85 box with its morph's label instead.
class RkEzMixerControlWgt : public QWidget
{
    Q_OBJECT
public:
    RkEzMixerControlWgt(QWidget* parent, RkEzMixerControl* control);
    ~RkEzMixerControlWgt() override;

    RkEzMixerControl* getControl() const;
    // The label the box of a control without a thumbnail shows.
    QString placeholderText() const;
    bool isPlaceholder() const;

protected:
    void mousePressEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void contextMenuEvent(QContextMenuEvent* event) override;

private Q_SLOTS:
    void remove();

private:
    // The mixer owns the control; the guard covers a control removed from elsewhere.
    QPointer<RkEzMixerControl> m_control;
    // Shows a labelled box instead of the thumbnail; decided once, with the widget's size.
    bool m_placeholder = false;
    bool m_dragging = false;
    QPoint m_startPos;
    QPoint m_startCursor;
};
