#pragma once

#include <QPoint>
#include <QPointer>
#include <QWidget>

class RkEzMixerDriver;

// The handle of a mixer page: a 30 by 30 square with four arrowheads, centred on the driver's
// point. Dragging it with the left button moves the driver, which drives the mixer on every
// move; one drag is one undo entry.
class RkEzMixerDriverWgt : public QWidget
{
    Q_OBJECT
public:
    RkEzMixerDriverWgt(QWidget* parent, RkEzMixerDriver* driver);
    ~RkEzMixerDriverWgt() override;

    RkEzMixerDriver* getDriver() const;

protected:
    void mousePressEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void enterEvent(QEvent* event) override;
    void leaveEvent(QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

private:
    void finishDrag();

    // The mixer owns the driver; the guard covers a mixer deleted before its page.
    QPointer<RkEzMixerDriver> m_driver;
    bool m_hovered = false;
    bool m_dragging = false;
    QPoint m_startPos;
    QPoint m_startCursor;
};
