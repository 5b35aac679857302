// The Shape tab's icon grid: BM_MixDrag/N times one mouse move of the mixing handle during a drag
// over N tiles (up to the eight of a page), each tile's morph written and recorded for undo;
// BM_ThumbnailPage times the eight thumbnails of a page made through the grid's own timer;
// BM_SelectFigure/N times the Shape tab taking up a newly selected figure of N morphs.
#include "app/rkmainwindow.h"
#include "demo/rkdemoscene.h"
#include "properties/rkfloatproperty.h"
#include "render/rk3dviewport.h"
#include "rkbenchmain.h"
#include "rkezicongridwgt.h"
#include "rkezpropertiescontrol.h"
#include "rkezpropertiesdragger.h"
#include "rkezpropertiespage.h"
#include "rkezpropertiespane.h"
#include "rkezpropertieswgt.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostack.h"

#include <QElapsedTimer>
#include <QMouseEvent>
#include <QStandardItemModel>
#include <QTimer>
#include <QWidget>

#include <benchmark/benchmark.h>

namespace
{

void sendMouse(QWidget* widget, QEvent::Type type, const QPoint& local, Qt::MouseButton button,
               Qt::MouseButtons buttons)
{
    QMouseEvent event(type, local, widget->mapToGlobal(local), button, buttons, Qt::NoModifier);
    QApplication::sendEvent(widget, &event);
}

} // namespace

static void BM_MixDrag(benchmark::State& state)
{
    const int n = int(state.range(0));
    RkSkeleton figure;
    QVector<RkProperty*> set;
    for (int i = 0; i < n; ++i) {
        const QString name = QString("Morph %1").arg(i);
        auto* morph = new RkFloatProperty(name, name);
        figure.addProperty(morph, QStringLiteral("Morphs"));
        set.append(morph);
    }
    RkEzIconGridWgt grid(nullptr, nullptr);
    grid.resize(grid.sizeHint());
    grid.addProperties(set);
    grid.show();
    QCoreApplication::processEvents();
    RkEzPropertiesDragger* dragger = grid.getDragger();
    const QRect bounds = grid.draggerBounds();

    const QPoint grab(20, 20);
    const QPoint start = dragger->pos();
    sendMouse(dragger, QEvent::MouseButtonPress, grab, Qt::LeftButton, Qt::LeftButton);
    int64_t step = 0;
    for (auto _ : state) {
        // The handle wanders over the whole page, as under a dragging hand.
        const QPoint target(bounds.left() + int(step * 7 % (bounds.width() + 1)),
                            bounds.top() + int(step * 13 % (bounds.height() + 1)));
        ++step;
        const QPoint local = grab + target - dragger->pos();
        sendMouse(dragger, QEvent::MouseMove, local, Qt::NoButton, Qt::LeftButton);
        // A drag's changes pile up in its hold; a fresh drag now and then keeps the pile at the
        // size of an ordinary one.
        if (step % 256 == 0) {
            state.PauseTiming();
            sendMouse(dragger, QEvent::MouseButtonRelease, grab, Qt::LeftButton, Qt::NoButton);
            rkUndoStack->clear();
            sendMouse(dragger, QEvent::MouseButtonPress, grab, Qt::LeftButton, Qt::LeftButton);
            state.ResumeTiming();
        }
    }
    sendMouse(dragger, QEvent::MouseButtonRelease, grab, Qt::LeftButton, Qt::NoButton);
    rkUndoStack->clear();
    if (dragger->pos() != start)
        state.SkipWithError("the handle did not return after the drag");
}
BENCHMARK(BM_MixDrag)->Arg(8)->Unit(benchmark::kMicrosecond);

// The eight thumbnails of one page, made by the grid's timer at the tiles' size in the pane, each
// with its morph dialled in and the camera framed, all taken back through cancelled holds.
static void BM_ThumbnailPage(benchmark::State& state)
{
    rkScene->clear();
    RkSkeleton* figure = rkBuildDemoScene(rkScene);
    rkScene->selectNode(figure);
    RkMainWindow window;
    window.resize(1024, 768);
    auto* view = new Rk3DViewport;
    window.setSceneWidget(view);
    window.show();
    QCoreApplication::processEvents();
    if (!view->canHardwareRender()) {
        state.SkipWithError("no offscreen rendering here");
        return;
    }
    QVector<RkProperty*> set;
    for (const RkDemoMorph& m : rkDemoMorphs()) {
        if (set.size() < 8)
            set.append(figure->findProperty(m.name));
    }
    RkEzIconGridWgt grid(nullptr, nullptr);
    grid.resize(grid.sizeHint());
    grid.addProperties(set);
    grid.show();
    QCoreApplication::processEvents();

    for (auto _ : state) {
        grid.scheduleMakeImages();
        while (grid.getTimer()->isActive())
            QCoreApplication::processEvents();
    }
    state.SetItemsProcessed(state.iterations() * grid.getTiles().size());
    const RkEzPropertiesControl* tile = grid.getTiles().first();
    if (tile->getImage().isNull())
        state.SkipWithError("no thumbnail was made");
    state.SetLabel(QString("%1x%2 px")
                       .arg(tile->getImageSize().width())
                       .arg(tile->getImageSize().height())
                       .toStdString());
    rkUndoStack->clear();
    rkScene->clear();
}
BENCHMARK(BM_ThumbnailPage)->Unit(benchmark::kMillisecond)->UseRealTime();

// From the selection of a figure of N morphs in 25 categories to its first page of tiles: the
// 20 ms selection timer, the category tree, the chooser's first level and the pages of the
// categories at the top.
static void BM_SelectFigure(benchmark::State& state)
{
    const int n = int(state.range(0));
    rkScene->clear();
    RkEzPropertiesPane pane;
    pane.resize(420, 760);
    pane.show();
    // The tab starts quiet until the scene is first cleared.
    rkScene->clear();
    auto* figure = new RkSkeleton;
    for (int i = 0; i < n; ++i) {
        const QString name = QString("Morph %1").arg(i);
        figure->addProperty(new RkFloatProperty(name, name), QString("Category %1").arg(i % 25));
    }
    rkScene->addNode(figure);
    RkEzPropertiesWgt* wgt = pane.getPropertiesWgt();
    auto settle = [&](bool selected) {
        QElapsedTimer clock;
        clock.start();
        while (clock.elapsed() < 5000) {
            QCoreApplication::processEvents();
            RkEzPropertiesPage* page = wgt->getCurrentPage();
            const bool shown = page && !page->getProperties().isEmpty();
            if (shown == selected && (wgt->getCategoryModel()->rowCount() > 0) == selected)
                return true;
        }
        return false;
    };
    for (auto _ : state) {
        state.PauseTiming();
        rkScene->clearSelection();
        if (!settle(false)) {
            state.SkipWithError("the pane did not empty");
            break;
        }
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
        state.ResumeTiming();
        rkScene->selectNode(figure);
        if (!settle(true)) {
            state.SkipWithError("no page was built");
            break;
        }
    }
    rkScene->clear();
}
BENCHMARK(BM_SelectFigure)->Arg(500)->Unit(benchmark::kMillisecond)->UseRealTime();

RK_BENCHMARK_MAIN(true)
