#pragma once

#include "io/rkbase.h"

#include <QPoint>

#include <memory>

// The handle of a mixer: a point on the mixer field that the user drags. Every move is
// announced with moved(); one drag, from startDrag() to endDrag(), is one undo entry.
class RkEzMixerDriver : public RkBase
{
    Q_OBJECT
public:
    RkEzMixerDriver();
    ~RkEzMixerDriver() override;

    int getX() const;
    int getY() const;
    QPoint getPoint() const;

    // Opens the drag's undo hold, then emits dragStarted().
    void startDrag();
    // Emits dragEnded(), then keeps the drag's changes as one undo entry "Shape Mixing".
    void endDrag();
    bool isDragging() const;
    // Stores the point and emits moved().
    void moveTo(int x, int y);

    void loadSection(RkInFile* file, short sectionId) override;
    void postLoadFile(RkInFile* file) override;
    void setPointer(const RkInFile* file, short sectionId, short index, RkBase* object) override;
    void save(RkOutFile* file) const override;

Q_SIGNALS:
    void moved(QPoint point);
    void dragStarted();
    void dragEnded();

private:
    struct Private;
    std::unique_ptr<Private> d;
};
