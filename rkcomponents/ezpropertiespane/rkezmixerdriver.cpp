#include "rkezmixerdriver.h"

#include "io/rkinfile.h"
#include "io/rkoutfile.h"
#include "undo/rkundostackhold.h"

namespace
{
constexpr short kPointSection = 0x231;
}

struct RkEzMixerDriver::Private {
    int x = 105;
    int y = 127;
    // Open only while the handle is dragged.
    std::unique_ptr<RkUndoStackHold> hold;
};

RkEzMixerDriver::RkEzMixerDriver() : RkBase(nullptr, QString()), d(new Private) {}

// A hold still open here (the mixer went away mid-drag) is dropped, which takes its changes back.
RkEzMixerDriver::~RkEzMixerDriver() = default;

int RkEzMixerDriver::getX() const
{
    return d->x;
}

int RkEzMixerDriver::getY() const
{
    return d->y;
}

QPoint RkEzMixerDriver::getPoint() const
{
    return QPoint(d->x, d->y);
}

void RkEzMixerDriver::startDrag()
{
    // A drag whose release never arrived is closed as the entry it was, not thrown away: the
    // user has been looking at its values.
    if (d->hold)
        endDrag();
    d->hold = std::make_unique<RkUndoStackHold>();
    Q_EMIT dragStarted();
}

void RkEzMixerDriver::endDrag()
{
    Q_EMIT dragEnded();
    if (d->hold) {
        d->hold->accept(QStringLiteral("Shape Mixing"));
        d->hold.reset();
    }
}

bool RkEzMixerDriver::isDragging() const
{
    return bool(d->hold);
}

void RkEzMixerDriver::moveTo(int x, int y)
{
    d->x = x;
    d->y = y;
    Q_EMIT moved(QPoint(x, y));
}

void RkEzMixerDriver::loadSection(RkInFile* file, short sectionId)
{
    if (sectionId != kPointSection) {
        RkBase::loadSection(file, sectionId);
        return;
    }
    int x = 0, y = 0;
    if (file->readInt(x) && file->readInt(y)) {
        d->x = x;
        d->y = y;
    }
}

void RkEzMixerDriver::postLoadFile(RkInFile*) {}

void RkEzMixerDriver::setPointer(const RkInFile*, short, short, RkBase*) {}

void RkEzMixerDriver::save(RkOutFile* file) const
{
    file->startSection(kPointSection);
    file->writeInt(d->x);
    file->writeInt(d->y);
    file->endSection();
}
