// Scene benchmarks: saving and loading the demo scene.
#include "rkapp.h"
#include "rkdemoscene.h"
#include "rkscene.h"
#include "rkscenefile.h"

#include <QApplication>

#include <benchmark/benchmark.h>

namespace
{

void ensureDemoScene()
{
    if (rkScene->getNumNodes() == 0)
        rkBuildDemoScene(rkScene);
}

} // namespace

static void BM_SaveScene(benchmark::State& state)
{
    ensureDemoScene();
    qint64 bytes = 0;
    for (auto _ : state) {
        const QByteArray file = RkSceneWriter::write(rkScene->getNodes());
        bytes = file.size();
        benchmark::DoNotOptimize(file.constData());
    }
    state.counters["bytes"] = double(bytes);
}
BENCHMARK(BM_SaveScene)->Unit(benchmark::kMicrosecond);

static void BM_LoadScene(benchmark::State& state)
{
    ensureDemoScene();
    const QByteArray file = RkSceneWriter::write(rkScene->getNodes());
    for (auto _ : state) {
        // Parse, build and check everything, then hand the nodes to the scene as a load does.
        RkSceneReader reader;
        if (!reader.read(file)) {
            state.SkipWithError(qPrintable(reader.errorString()));
            break;
        }
        const RkNodeList nodes = reader.takeNodes();
        state.PauseTiming();
        qDeleteAll(nodes);
        state.ResumeTiming();
    }
}
BENCHMARK(BM_LoadScene)->Unit(benchmark::kMicrosecond);

int main(int argc, char** argv)
{
    QApplication app(argc, argv);
    RkApp core;
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv))
        return 1;
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
