// The mixer's drive runs on every mouse move of its handle. BM_DriveReference and BM_Drive time
// one move's weights (building the system and solving it) the long way, one elimination per
// control, and the way the mixer does it, one factorisation per move.
#include "rkezmixersolver.h"

#include <QRandomGenerator>

#include <benchmark/benchmark.h>

namespace {

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

void BM_DriveReference(benchmark::State& state)
{
    const QVector<QPoint> points = scatter(int(state.range(0)));
    RkEzMixerSolver solver;
    QVector<float> weights;
    int64_t step = 0;
    for (auto _ : state) {
        solver.setPoints(points);
        benchmark::DoNotOptimize(solver.referenceWeights(driverAt(step++), weights));
        benchmark::ClobberMemory();
    }
}

void BM_Drive(benchmark::State& state)
{
    const QVector<QPoint> points = scatter(int(state.range(0)));
    RkEzMixerSolver solver;
    QVector<float> weights;
    int64_t step = 0;
    for (auto _ : state) {
        solver.setPoints(points);
        benchmark::DoNotOptimize(solver.weights(driverAt(step++), weights));
        benchmark::ClobberMemory();
    }
}

} // namespace

BENCHMARK(BM_DriveReference)->RangeMultiplier(2)->Range(2, 64)->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_Drive)->RangeMultiplier(2)->Range(2, 64)->Unit(benchmark::kMicrosecond);

BENCHMARK_MAIN();
