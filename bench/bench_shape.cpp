// The Shape tab's mixing handle: BM_MixDrag/N times one mouse move of the handle during a drag
// over N tiles (up to the eight of a page), each tile's morph written and recorded for undo.
#include "properties/rkfloatproperty.h"
#include "rkbenchmain.h"
#include "rkezpropertiesdragger.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostack.h"

#include <QGridLayout>
#include <QMouseEvent>
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
    QWidget page;
    auto* grid = new QGridLayout(&page);
    grid->setContentsMargins(0, 0, 0, 0);
    grid->setSpacing(0);
    page.resize(240, 240);
    RkSkeleton figure;
    auto* dragger = new RkEzPropertiesDragger(&page);
    for (int i = 0; i < n; ++i) {
        const int cell = i < 4 ? i : i + 1;
        auto* tile = new QWidget(&page);
        tile->setFixedSize(80, 80);
        grid->addWidget(tile, cell / 3, cell % 3);
        const QString name = QString("Morph %1").arg(i);
        auto* morph = new RkFloatProperty(name, name);
        figure.addProperty(morph, QStringLiteral("Morphs"));
        dragger->addTile(tile, morph);
    }
    dragger->setMixArea(grid);
    page.show();
    grid->activate();
    dragger->setGeometry(grid->cellRect(1, 1));
    dragger->raise();

    const QPoint grab(40, 40);
    const QPoint start = dragger->pos();
    sendMouse(dragger, QEvent::MouseButtonPress, grab, Qt::LeftButton, Qt::LeftButton);
    int64_t step = 0;
    for (auto _ : state) {
        // The handle wanders over the whole page, as under a dragging hand.
        const QPoint target(int(step * 7 % 161), int(step * 13 % 161));
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

RK_BENCHMARK_MAIN(false)
