// Parameters list benchmarks: the property list rebuilt on a selection change, two nodes of N
// properties in 40 groups shown in turn, with the list's pools and, for reference, with new
// groups and widgets made every time.
#include "app/rkapp.h"
#include "app/rkstyle.h"
#include "plugin/rkclassfactory.h"
#include "properties/rkboolproperty.h"
#include "properties/rkfloatproperty.h"
#include "properties/rkintproperty.h"
#include "properties/rkpropertygroup.h"
#include "properties/rkpropertygrouptree.h"
#include "rkbenchmain.h"
#include "rkpropertypanelist.h"
#include "scene/rknode.h"
#include "scene/rkscene.h"
#include "widgets/rkpropertywgt.h"
#include "widgets/rkwidgetgroup.h"
#include "widgets/rkwidgetlistlayout.h"

#include <QApplication>
#include <QScrollArea>
#include <QSet>

#include <benchmark/benchmark.h>

#include <array>
#include <memory>

namespace
{

// A node with n float, integer and on/off properties in turn, spread over 8 top-level groups of
// 5 sub-groups each. A third of 2000 stays within a pool's 769 widgets. The nodes share their
// labels, as bones of a figure do, but not their values: every widget shows something new.
RkNode* makeNode(const QString& name, int n, bool set)
{
    auto* node = new RkNode;
    node->setObjectName(name);
    for (int i = 0; i < n; ++i) {
        const int group = i % 40;
        const QString id = QStringLiteral("p%1").arg(i);
        const QString label = QStringLiteral("Morph %1").arg(i);
        RkProperty* property = nullptr;
        if (i % 3 == 0)
            property = new RkFloatProperty(id, label);
        else if (i % 3 == 1)
            property = new RkIntProperty(id, label);
        else
            property = new RkBoolProperty(id, label);
        if (set)
            property->setValueVariant(i % 3 == 2 ? QVariant(true) : QVariant(1.25 + i % 7));
        node->addProperty(property,
                          QStringLiteral("Morphs %1/Set %2").arg(group / 5).arg(group % 5));
    }
    rkScene->addNode(node);
    return node;
}

struct Setup {
    Setup(int n)
    {
        RkStyle::install();
        nodes = {makeNode(QStringLiteral("A"), n, false), makeNode(QStringLiteral("B"), n, true)};
        window = std::make_unique<QWidget>();
        window->resize(320, 800);
        window->show();
        QApplication::processEvents();
    }
    ~Setup()
    {
        window.reset();
        rkScene->clear();
    }
    std::array<RkNode*, 2> nodes{};
    std::unique_ptr<QWidget> window;
};

QSet<QWidget*> widgetsBelow(QWidget* widget)
{
    const QList<QWidget*> all = widget->findChildren<QWidget*>();
    return QSet<QWidget*>(all.cbegin(), all.cend());
}

void addGroups(QScrollArea* area, RkWidgetListLayout* layout, RkPropertyGroup* group)
{
    const QList<RkProperty*> properties = group->getProperties();
    if (!properties.isEmpty()) {
        const QString path = group->getPath();
        const int slash = path.indexOf(QLatin1Char('/'));
        RkWidgetGroup* top = nullptr;
        const QString topText = slash < 0 ? path : path.left(slash);
        for (auto* candidate :
             area->widget()->findChildren<RkWidgetGroup*>(QString(), Qt::FindDirectChildrenOnly)) {
            if (candidate->text() == topText)
                top = candidate;
        }
        if (!top)
            top = new RkWidgetGroup(layout, topText, QStringLiteral("WidgetGroup"), 0);
        RkWidgetGroup* target = slash < 0 ? top : top->getGroup(path.mid(slash + 1), true);
        for (RkProperty* property : properties) {
            RkClassFactory* factory = RkApp::findClassFactory(property->widgetClassName());
            auto* widget = qobject_cast<RkPropertyWgt*>(factory->createInstance());
            widget->addProperty(property);
            target->addWidget(widget);
        }
    }
    for (RkPropertyGroup* child : group->getChildren())
        addGroups(area, layout, child);
}

} // namespace

// One selection change: the pooled list emptied and filled with the other node's groups.
static void BM_ParametersReselect(benchmark::State& state)
{
    Setup setup(int(state.range(0)));
    auto* list = new RkPropertyPaneList(setup.window.get(), QStringLiteral("PropertiesList"));
    list->setShowFavorites(false);
    list->resize(300, 780);
    list->show();
    int next = 0;
    int done = 0;
    QSet<QWidget*> afterTwo;
    for (auto _ : state) {
        if (done++ == 2) {
            state.PauseTiming();
            afterTwo = widgetsBelow(list);
            state.ResumeTiming();
        }
        // As the pane does: the list stays shown while it is emptied and filled.
        list->clear();
        list->addPropertyGroups(setup.nodes[next]->getPropertyGroups(), false);
        list->show();
        list->finishBuild();
        // The pane returns to the event loop, which lays the list out and paints it.
        QApplication::processEvents();
        next = 1 - next;
    }
    // Widgets made after the first two selections (none: the pools hold them all).
    if (done > 2)
        state.counters["made"] = double((widgetsBelow(list) - afterTwo).size());
}
BENCHMARK(BM_ParametersReselect)->Arg(500)->Arg(2000)->Unit(benchmark::kMillisecond);

// The same change without pools: the old content deleted, new groups and widgets made.
static void BM_ParametersReselectReference(benchmark::State& state)
{
    Setup setup(int(state.range(0)));
    auto* area = new QScrollArea(setup.window.get());
    area->setWidgetResizable(true);
    area->resize(300, 780);
    area->show();
    int next = 0;
    for (auto _ : state) {
        area->hide();
        auto* content = new QWidget;
        auto* layout = new RkWidgetListLayout(content);
        layout->setSizeConstraint(QLayout::SetMinAndMaxSize);
        layout->setAlignment(Qt::AlignTop);
        area->setWidget(content); // deletes the previous content
        for (RkPropertyGroup* group : setup.nodes[next]->getPropertyGroups()->getTopGroups())
            addGroups(area, layout, group);
        area->show();
        content->setMinimumSize(layout->minimumSize());
        QApplication::processEvents();
        next = 1 - next;
    }
}
BENCHMARK(BM_ParametersReselectReference)->Arg(500)->Unit(benchmark::kMillisecond);

RK_BENCHMARK_MAIN(true)
