// Property widget benchmarks: making a float property widget, reusing one from a pool, and one
// mouse move of a slider drag with the property write it makes.
#include "app/rkapp.h"
#include "app/rkstyle.h"
#include "plugin/rkclassfactory.h"
#include "properties/rkfloatproperty.h"
#include "rkbenchmain.h"
#include "undo/rkundostack.h"
#include "widgets/rkfloatpropertywgt.h"
#include "widgets/rkfloatslider.h"

#include <QApplication>
#include <QMouseEvent>

#include <benchmark/benchmark.h>

#include <memory>
#include <vector>

namespace
{

// The shown content widget of a property list that the widgets go into.
std::unique_ptr<QWidget> makeList()
{
    RkStyle::install();
    auto list = std::make_unique<QWidget>();
    list->resize(300, 600);
    list->show();
    QApplication::processEvents();
    return list;
}

void send(QWidget* w, QEvent::Type type, QPoint pos, Qt::MouseButtons buttons)
{
    QMouseEvent event(type, pos, w->mapToGlobal(pos),
                      type == QEvent::MouseMove ? Qt::NoButton : Qt::LeftButton, buttons,
                      Qt::NoModifier);
    QApplication::sendEvent(w, &event);
}

} // namespace

// What a list's widget pool does when it has no widget left: make one through the class
// factory, put it in the list and show it.
static void BM_CreateFloatPropertyWgt(benchmark::State& state)
{
    const auto list = makeList();
    RkFloatProperty property(QStringLiteral("bend"), QStringLiteral("Bend"));
    RkClassFactory* factory = RkApp::findClassFactory(QStringLiteral("RkFloatPropertyWgt"));
    std::vector<QWidget*> made;
    for (auto _ : state) {
        auto* widget = qobject_cast<RkFloatPropertyWgt*>(factory->createInstance());
        widget->setParent(list.get());
        widget->addProperty(&property);
        widget->show();
        made.push_back(widget);
        if (made.size() == 256) {
            state.PauseTiming();
            qDeleteAll(made);
            made.clear();
            QApplication::processEvents();
            state.ResumeTiming();
        }
    }
    qDeleteAll(made);
}
BENCHMARK(BM_CreateFloatPropertyWgt)->Unit(benchmark::kMicrosecond);

// What the pool does on every rebuild: the same widget takes another property.
static void BM_ReuseFloatPropertyWgt(benchmark::State& state)
{
    const auto list = makeList();
    RkFloatProperty a(QStringLiteral("bend"), QStringLiteral("Bend"));
    RkFloatProperty b(QStringLiteral("twist"), QStringLiteral("Twist"));
    b.setDisplayAsPercent(true);
    b.setMinMax(-1, 1);
    RkFloatPropertyWgt widget(list.get());
    widget.show();
    bool odd = false;
    for (auto _ : state) {
        widget.removeAllProperties();
        widget.addProperty(odd ? &a : &b);
        widget.show();
        odd = !odd;
    }
}
BENCHMARK(BM_ReuseFloatPropertyWgt)->Unit(benchmark::kMicrosecond);

// One pointer move of a drag on the slider: the value follows the pointer and the property is
// written under the drag's open undo hold.
static void BM_SliderDragEvent(benchmark::State& state)
{
    const auto list = makeList();
    RkFloatProperty property(QStringLiteral("bend"), QStringLiteral("Bend"));
    RkFloatPropertyWgt widget(list.get());
    widget.addProperty(&property);
    widget.resize(280, widget.sizeHint().height());
    widget.show();
    QApplication::processEvents();
    auto* slider = widget.findChild<RkFloatSlider*>();
    const QPoint start = slider->calcSliderRect().center();
    const auto press = [&] {
        send(slider, QEvent::MouseButtonPress, start, Qt::LeftButton);
        send(slider, QEvent::MouseMove, start + QPoint(20, 0), Qt::LeftButton);
    };
    press();
    int moves = 0;
    for (auto _ : state) {
        // Back and forth by one pixel: every move changes the value.
        send(slider, QEvent::MouseMove, start + QPoint(21 - (moves & 1), 0), Qt::LeftButton);
        // A drag's hold keeps every write until the drag ends: end one now and then.
        if (++moves % 4096 == 0) {
            state.PauseTiming();
            send(slider, QEvent::MouseButtonRelease, start, Qt::NoButton);
            rkUndoStack->clear();
            press();
            state.ResumeTiming();
        }
    }
    send(slider, QEvent::MouseButtonRelease, start, Qt::NoButton);
    if (!rkUndoStack->canUndo() && moves > 0)
        state.SkipWithError("the drag made no undo entry");
}
BENCHMARK(BM_SliderDragEvent)->Unit(benchmark::kMicrosecond);

RK_BENCHMARK_MAIN(true)
