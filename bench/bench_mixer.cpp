// The mixer's drive runs on every mouse move of its handle. BM_DriveReference and BM_Drive time
// one move's weights (building the system and solving it) the long way, one elimination per
// control, and the way the mixer does it, one factorisation per move. BM_DriveApply times a
// whole move of a mixer during a drag: the weights and the writes to the morphs, each recorded
// for undo.
#include "app/rkapp.h"
#include "properties/rkfloatproperty.h"
#include "rkbenchmain.h"
#include "rkezmixer.h"
#include "rkezmixercontrol.h"
#include "rkezmixerdriver.h"
#include "rkezmixerreference.h"
#include "rkezmixersolver.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostackhold.h"

#include <QApplication>
#include <QRandomGenerator>

#include <benchmark/benchmark.h>

#include <memory>

namespace
{

QVector<QPoint> scatter(int count)
{
    QRandomGenerator random(count);
    QVector<QPoint> points;
    while (points.size() < count) {
        const QPoint p(random.bounded(210), random.bounded(254));
        if (!points.contains(p))
            points.append(p);
    }
    return points;
}

// The driver wanders over the field, as under a dragging hand.
QPoint driverAt(int64_t step)
{
    return QPoint(15 + int(step * 7 % 180), 15 + int(step * 13 % 224));
}

// One move's weights, the system rebuilt for the layout as a drag does it, by the given way.
template <typename Weights> void driveWeights(benchmark::State& state, Weights weightsOf)
{
    const QVector<QPoint> points = scatter(int(state.range(0)));
    RkEzMixerSolver solver;
    QVector<float> weights;
    int64_t step = 0;
    for (auto _ : state) {
        solver.setPoints(points);
        benchmark::DoNotOptimize(weightsOf(solver, driverAt(step++), weights));
        benchmark::ClobberMemory();
    }
}

void BM_DriveReference(benchmark::State& state)
{
    driveWeights(state, [](RkEzMixerSolver& solver, const QPoint& driver, QVector<float>& weights) {
        return rkEzMixerReferenceWeights(solver, driver, weights);
    });
}

void BM_Drive(benchmark::State& state)
{
    driveWeights(state, [](RkEzMixerSolver& solver, const QPoint& driver, QVector<float>& weights) {
        return solver.weights(driver, weights);
    });
}

void BM_DriveApply(benchmark::State& state)
{
    const int n = int(state.range(0));
    const QVector<QPoint> points = scatter(n);
    RkSkeleton figure;
    RkEzMixer mixer;
    for (int i = 0; i < n; ++i) {
        auto* morph = new RkFloatProperty(QString("Morph %1").arg(i), QString("Morph %1").arg(i));
        figure.addProperty(morph, QStringLiteral("Morphs"));
        auto* control = new RkEzMixerControl;
        control->setControlProperty(morph);
        control->setX(points[i].x());
        control->setY(points[i].y());
        mixer.addControl(control);
    }
    RkEzMixerDriver* driver = mixer.getDriver();
    // The changes of a drag pile up in its hold; a fresh hold now and then keeps the pile (and
    // the memory it takes) at the size of an ordinary drag.
    auto hold = std::make_unique<RkUndoStackHold>();
    int64_t step = 0;
    for (auto _ : state) {
        const QPoint p = driverAt(step++);
        driver->moveTo(p.x(), p.y());
        if (step % 256 == 0) {
            state.PauseTiming();
            hold->cancel();
            hold = std::make_unique<RkUndoStackHold>();
            state.ResumeTiming();
        }
    }
    hold->cancel();
}

} // namespace

BENCHMARK(BM_DriveReference)->RangeMultiplier(2)->Range(2, 64)->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_Drive)->RangeMultiplier(2)->Range(2, 64)->Unit(benchmark::kMicrosecond);

BENCHMARK(BM_DriveApply)->RangeMultiplier(2)->Range(2, 64)->Unit(benchmark::kMicrosecond);

RK_BENCHMARK_MAIN(false)
