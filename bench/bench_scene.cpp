// Scene benchmarks: saving and loading the demo scene, deforming and rendering its figure.
#include "app/rkapp.h"
#include "demo/rkdemoscene.h"
#include "properties/rkfloatproperty.h"
#include "render/rk3dviewport.h"
#include "render/rkimagerenderhandler.h"
#include "rkbenchmain.h"
#include "scene/rkbone.h"
#include "scene/rkobject.h"
#include "scene/rkscene.h"
#include "scene/rkscenefile.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostackhold.h"

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

namespace
{

RkSkeleton* demoFigure()
{
    ensureDemoScene();
    return qobject_cast<RkSkeleton*>(rkScene->findNode(QLatin1String(RkDemoFigureName)));
}

QList<RkFloatProperty*> morphsOf(RkSkeleton* figure)
{
    QList<RkFloatProperty*> morphs;
    for (const RkDemoMorph& m : rkDemoMorphs()) {
        if (auto* p = qobject_cast<RkFloatProperty*>(figure->findProperty(m.name)))
            morphs.append(p);
    }
    return morphs;
}

// Makes one thumbnail the way the shape pane does: frame the camera and dial a morph to full
// inside an undo hold, render, take everything back.
class ThumbnailHandler : public RkImageRenderHandler
{
public:
    ThumbnailHandler(Rk3DViewport* view, RkFloatProperty* morph)
        : RkImageRenderHandler(QSize(96, 96), 0, QString()), m_view(view), m_morph(morph)
    {
        setBackColor(view->getBackground());
    }
    void renderStarting() override
    {
        RkImageRenderHandler::renderStarting();
        m_hold = std::make_unique<RkUndoStackHold>();
        m_view->frameCamera();
    }
    void frameStarting(int) override { m_morph->setValue(1.0f); }
    void renderFinished() override
    {
        RkImageRenderHandler::renderFinished();
        m_hold->cancel();
        m_hold.reset();
    }

private:
    Rk3DViewport* m_view;
    RkFloatProperty* m_morph;
    std::unique_ptr<RkUndoStackHold> m_hold;
};

} // namespace

// The 24 morphs at half strength and a pose on every bone, applied to every bone's mesh.
static void BM_DeformMesh(benchmark::State& state)
{
    RkSkeleton* figure = demoFigure();
    const QList<RkFloatProperty*> morphs = morphsOf(figure);
    for (RkFloatProperty* m : morphs)
        m->setValue(0.5f);
    QList<RkBone*> bones;
    figure->getAllBones(bones);
    for (int i = 0; i < bones.size(); ++i) {
        bones[i]->getXRotate()->setValue(float(i % 5) * 4.0f);
        bones[i]->getZRotate()->setValue(float(i % 3) * 6.0f);
    }
    QVector<RkVec3> out;
    qint64 vertices = 0;
    for (auto _ : state) {
        vertices = 0;
        for (RkBone* bone : bones) {
            if (RkObject* object = bone->getObject()) {
                object->getDeformedVertices(out);
                vertices += out.size();
                benchmark::DoNotOptimize(out.constData());
            }
        }
    }
    state.counters["morphs"] = double(morphs.size());
    state.counters["vertices"] = double(vertices);
    for (RkFloatProperty* m : morphs)
        m->setValue(0.0f);
    for (RkBone* bone : bones) {
        bone->getXRotate()->setValue(0.0f);
        bone->getZRotate()->setValue(0.0f);
    }
}
BENCHMARK(BM_DeformMesh)->Unit(benchmark::kMicrosecond);

// One 96x96 thumbnail of the figure with one morph at full strength, rendered offscreen.
static void BM_RenderThumbnail(benchmark::State& state)
{
    RkSkeleton* figure = demoFigure();
    rkScene->selectNode(figure);
    Rk3DViewport view;
    view.resize(400, 300);
    if (!view.canHardwareRender()) {
        state.SkipWithError("no offscreen rendering here");
        return;
    }
    const QList<RkFloatProperty*> morphs = morphsOf(figure);
    int next = 0;
    for (auto _ : state) {
        ThumbnailHandler handler(&view, morphs[next++ % morphs.size()]);
        if (!view.hardwareRender(&handler)) {
            state.SkipWithError("render refused");
            break;
        }
        benchmark::DoNotOptimize(handler.getImage().constBits());
    }
    rkScene->clearSelection();
}
BENCHMARK(BM_RenderThumbnail)->Unit(benchmark::kMillisecond);

RK_BENCHMARK_MAIN(true)
