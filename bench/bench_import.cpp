// Model import and skinned deformation: the largest skinned test model read and added to the
// scene, and one deformation of a large synthetic skinned, morphed mesh.
#include "geometry/rkmeshdeformer.h"
#include "import/rkimporter.h"
#include "rkbenchmain.h"
#include "scene/rknode.h"
#include "scene/rkscene.h"

#include <QFile>

#include <benchmark/benchmark.h>

#include <cmath>

namespace
{

// 3205 vertices skinned to 37 bones: the largest skinned model of Debian's assimp-testmodels.
const char* const LargestSkinned = "/usr/share/assimp/models/X/Testwuson.X";

// A grid of n vertices, each weighted to four of 60 bones, with 24 morphs that each move a
// tenth of the vertices.
RkMeshDeformer makeSkinnedMesh(int n)
{
    RkMeshDeformer d;
    QVector<RkVec3> rest(n);
    const int side = int(std::ceil(std::sqrt(double(n))));
    for (int i = 0; i < n; ++i)
        rest[i] =
            RkVec3(float(i % side) / side, float(i / side) / side, 0.1f * std::sin(i * 0.01f));
    d.setRestPositions(rest);
    for (int m = 0; m < 24; ++m) {
        RkMorphDeltas morph;
        morph.name = QStringLiteral("Morph %1").arg(m);
        for (int i = m * (n / 24); i < n && morph.indices.size() < n / 10; ++i) {
            morph.indices.append(i);
            morph.deltas.append(RkVec3(0.01f * m, 0.002f, -0.003f * m));
        }
        d.addMorph(morph);
    }
    for (int i = 0; i < n; ++i) {
        const int b = (i / side) * 60 / side;
        const RkBoneInfluence inf[4] = {
            {b, 0.5f}, {(b + 1) % 60, 0.25f}, {(b + 2) % 60, 0.15f}, {(b + 59) % 60, 0.1f}};
        d.setVertexInfluences(i, inf, 4);
    }
    return d;
}

template <bool Threaded> void deformSkinned(benchmark::State& state)
{
    const int n = int(state.range(0));
    const RkMeshDeformer d = makeSkinnedMesh(n);
    float weights[24];
    for (int m = 0; m < 24; ++m)
        weights[m] = 0.5f;
    RkXform bones[60];
    for (int b = 0; b < 60; ++b)
        bones[b] = RkXform::rotationAbout(RkVec3(0, b / 60.0f, 0), 5.0f * (b % 7), 3.0f, -2.0f);
    QVector<RkVec3> out;
    for (auto _ : state) {
        if (Threaded)
            d.deform(weights, 24, bones, 60, out);
        else
            d.deformSingleThreaded(weights, 24, bones, 60, out);
        benchmark::DoNotOptimize(out.constData());
    }
    state.SetItemsProcessed(state.iterations() * n);
}

} // namespace

static void BM_ImportLargest(benchmark::State& state)
{
    if (!QFile::exists(QLatin1String(LargestSkinned))) {
        state.SkipWithError("assimp-testmodels is not installed");
        return;
    }
    int vertices = 0;
    for (auto _ : state) {
        RkImporter importer;
        if (!importer.read(QLatin1String(LargestSkinned))) {
            state.SkipWithError(qPrintable(importer.errorString()));
            break;
        }
        vertices = importer.getNumVertices();
        RkNode* node = importer.addToScene(rkScene);
        state.PauseTiming();
        rkScene->removeNode(node);
        state.ResumeTiming();
    }
    state.counters["vertices"] = vertices;
}
BENCHMARK(BM_ImportLargest)->Unit(benchmark::kMillisecond);

static void BM_DeformSkinned(benchmark::State& state)
{
    deformSkinned<true>(state);
}
BENCHMARK(BM_DeformSkinned)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond)->UseRealTime();

static void BM_DeformSkinnedSingleThreaded(benchmark::State& state)
{
    deformSkinned<false>(state);
}
BENCHMARK(BM_DeformSkinnedSingleThreaded)->Arg(100000)->Unit(benchmark::kMillisecond);

RK_BENCHMARK_MAIN(false)
