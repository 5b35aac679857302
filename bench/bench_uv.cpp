// UV view benchmarks: building the records of a mesh of N quads, and drawing them into a
// 1024 x 1024 offscreen buffer the long way (immediate mode, walking the lists) and from the packed
// arrays. Each draw ends with glFinish, so the time includes the rasterising.
#include "geometry/rkpolymesh.h"
#include "rkbenchmain.h"
#include "rkuvrenderer.h"
#include "rkuvset.h"

#include <QOffscreenSurface>
#include <QOpenGLContext>
#include <QOpenGLFramebufferObject>

#include <cmath>
#include <map>

namespace
{

constexpr int PictureSize = 1024;

// A grid of N quads over the unit square (cols x rows, as square as N allows).
std::unique_ptr<RkPolyMesh> gridMesh(int quads)
{
    int cols = int(std::sqrt(double(quads)));
    while (quads % cols != 0)
        --cols;
    const int rows = quads / cols;
    auto mesh = std::make_unique<RkPolyMesh>();
    for (int r = 0; r <= rows; ++r) {
        for (int c = 0; c <= cols; ++c) {
            mesh->addVertex(RkVec3(float(c), float(r), 0.0f));
            mesh->addUV(float(c) / float(cols), float(r) / float(rows));
        }
    }
    for (int r = 0; r < rows; ++r) {
        for (int c = 0; c < cols; ++c) {
            const int a = r * (cols + 1) + c;
            RkQuadFacet q;
            const int corners[4] = {a, a + 1, a + cols + 2, a + cols + 1};
            for (int i = 0; i < 4; ++i)
                q.vertices[i] = q.uvs[i] = corners[i];
            q.material = quint8((r + c) % 4);
            mesh->addQuad(q);
        }
    }
    return mesh;
}

// One record per size, built once and shared by the draw benchmarks.
RkUVSet* recordFor(int quads)
{
    static std::map<int, std::unique_ptr<RkUVSet>> records;
    std::unique_ptr<RkUVSet>& record = records[quads];
    if (!record)
        record = std::make_unique<RkUVSet>(gridMesh(quads).get());
    return record.get();
}

// The offscreen buffer, made current on first use.
bool makeBufferCurrent()
{
    static QOffscreenSurface* surface = nullptr;
    static QOpenGLContext* context = nullptr;
    static QOpenGLFramebufferObject* buffer = nullptr;
    if (!context) {
        surface = new QOffscreenSurface;
        surface->create();
        context = new QOpenGLContext;
        if (!context->create() || !context->makeCurrent(surface))
            return false;
        buffer = new QOpenGLFramebufferObject(PictureSize, PictureSize);
        RkUVRenderer::initialize();
    }
    return context->makeCurrent(surface) && buffer->bind();
}

void drawBenchmark(benchmark::State& state, RkUVRenderer::Path path)
{
    RkUVSet* record = recordFor(int(state.range(0)));
    record->getPacked(); // built once per record, outside the timing
    if (!makeBufferCurrent()) {
        state.SkipWithError("no offscreen GL buffer");
        return;
    }
    glViewport(0, 0, PictureSize, PictureSize);
    const QList<RkUVSet*> sets = {record};
    for (auto _ : state) {
        RkUVRenderer::paint(sets, PictureSize, PictureSize, 0.5f, 0.5f, 0.9f, path);
        glFinish();
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}

} // namespace

static void BM_BuildUVSet(benchmark::State& state)
{
    const std::unique_ptr<RkPolyMesh> mesh = gridMesh(int(state.range(0)));
    for (auto _ : state) {
        RkUVSet set(mesh.get());
        benchmark::DoNotOptimize(&set.getPacked());
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(BM_BuildUVSet)->Arg(10000)->Arg(100000)->Arg(1000000)->Unit(benchmark::kMillisecond);

static void BM_DrawUVReference(benchmark::State& state)
{
    drawBenchmark(state, RkUVRenderer::Reference);
}
BENCHMARK(BM_DrawUVReference)
    ->Arg(10000)
    ->Arg(100000)
    ->Arg(1000000)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime();

static void BM_DrawUV(benchmark::State& state)
{
    drawBenchmark(state, RkUVRenderer::Arrays);
}
BENCHMARK(BM_DrawUV)
    ->Arg(10000)
    ->Arg(100000)
    ->Arg(1000000)
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime();

RK_BENCHMARK_MAIN(true)
