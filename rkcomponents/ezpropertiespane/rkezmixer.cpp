#include "rkezmixer.h"

#include "io/rkinfile.h"
#include "io/rkoutfile.h"
#include "properties/rkfloatproperty.h"
#include "rkassertcast.h"
#include "rkezmixercontrol.h"
#include "rkezmixerdriver.h"
#include "rkezmixersolver.h"

#include <cmath>

namespace
{
constexpr short kControlsSection = 0x220;
constexpr short kDriverSection = 0x230;
} // namespace

struct RkEzMixer::Private {
    RkEzMixerDriver* driver = nullptr;
    QVector<RkEzMixerControl*> controls;
    // Kept between moves so that a move allocates nothing.
    RkEzMixerSolver solver;
    QVector<QPoint> points;
    QVector<float> weights;
    QVector<float> values;
};

RkEzMixer::RkEzMixer() : RkBase(nullptr, QString()), d(new Private)
{
    adoptDriver(new RkEzMixerDriver);
}

RkEzMixer::~RkEzMixer()
{
    delete d->driver;
    d->driver = nullptr;
    qDeleteAll(d->controls);
    d->controls.clear();
}

RkEzMixerDriver* RkEzMixer::getDriver() const
{
    return d->driver;
}

const QVector<RkEzMixerControl*>& RkEzMixer::getControls() const
{
    return d->controls;
}

void RkEzMixer::addControl(RkEzMixerControl* control)
{
    if (!control || d->controls.contains(control))
        return;
    control->setParent(this);
    control->setMixer(this);
    d->controls.append(control);
}

void RkEzMixer::removeControl(RkEzMixerControl* control)
{
    const int i = d->controls.indexOf(control);
    if (i < 0)
        return;
    d->controls.remove(i);
    control->deleteLater();
}

// Takes the driver over and listens to all of it: a mixer read from a file drags, edits and
// undoes exactly like one made in this session.
void RkEzMixer::adoptDriver(RkEzMixerDriver* driver)
{
    if (driver == d->driver)
        return;
    delete d->driver;
    d->driver = driver;
    driver->setParent(this);
    connect(driver, &RkEzMixerDriver::moved, this, &RkEzMixer::drive);
    connect(driver, &RkEzMixerDriver::dragStarted, this, &RkEzMixer::beginEdit);
    connect(driver, &RkEzMixerDriver::dragEnded, this, &RkEzMixer::finishEdit);
}

void RkEzMixer::drive()
{
    // A copy, so that a control taken out by a reaction to one of the writes below does not
    // shift the rest; removed controls are only deleted later.
    const QVector<RkEzMixerControl*> controls = d->controls;
    const int n = controls.size();
    if (n < 2)
        return;
    d->points.resize(n);
    for (int i = 0; i < n; ++i)
        d->points[i] = controls[i]->getPoint();
    d->solver.setPoints(d->points);
    // Two controls on one point leave no weights: the move changes nothing.
    if (!d->solver.weights(d->driver->getPoint(), d->weights))
        return;

    // All values are worked out first, so that a move sets every morph or none.
    d->values.resize(n);
    for (int i = 0; i < n; ++i) {
        d->values[i] = controls[i]->getValue() * d->weights[i];
        if (controls[i]->getControlProperty() && !std::isfinite(d->values[i]))
            return;
    }
    for (int i = 0; i < n; ++i) {
        if (RkFloatProperty* property = controls[i]->getControlProperty())
            property->setValue(d->values[i]);
    }
}

void RkEzMixer::beginEdit()
{
    for (RkEzMixerControl* control : qAsConst(d->controls)) {
        if (RkFloatProperty* property = control->getControlProperty())
            property->beginEdit();
    }
}

void RkEzMixer::finishEdit()
{
    for (RkEzMixerControl* control : qAsConst(d->controls)) {
        if (RkFloatProperty* property = control->getControlProperty())
            property->finishEdit();
    }
}

void RkEzMixer::loadSection(RkInFile* file, short sectionId)
{
    switch (sectionId) {
    case kControlsSection:
        while (file->readPointer() == 0) {
        }
        break;
    case kDriverSection:
        file->readPointer();
        break;
    default:
        RkBase::loadSection(file, sectionId);
    }
}

void RkEzMixer::postLoadFile(RkInFile*) {}

void RkEzMixer::setPointer(const RkInFile*, short sectionId, short, RkBase* object)
{
    switch (sectionId) {
    case kControlsSection:
        // A missing control is left out rather than kept as a hole in the list.
        if (RkEzMixerControl* control = rkAssertCast<RkEzMixerControl>(object))
            addControl(control);
        break;
    case kDriverSection:
        // Without a stored driver the mixer keeps the one it was made with.
        if (RkEzMixerDriver* driver = rkAssertCast<RkEzMixerDriver>(object))
            adoptDriver(driver);
        break;
    default:
        break;
    }
}

void RkEzMixer::save(RkOutFile* file) const
{
    file->startSection(kControlsSection);
    for (int i = 0; i < d->controls.size(); ++i)
        file->writePointer(d->controls[i], short(i));
    file->endSection();
    file->writePointerSection(kDriverSection, d->driver, 0);
}
