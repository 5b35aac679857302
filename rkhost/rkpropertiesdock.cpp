#include "rkpropertiesdock.h"

#include "app/rkapp.h"
#include "app/rkmainwindow.h"
#include "plugin/rkclassfactory.h"
#include "properties/rkproperty.h"
#include "properties/rkpropertygroup.h"
#include "properties/rkpropertygrouptree.h"
#include "scene/rknode.h"
#include "scene/rkscene.h"
#include "widgets/rkpropertywgt.h"
#include "widgets/rkwidgetgroup.h"
#include "widgets/rkwidgetlistlayout.h"

#include <QLabel>
#include <QPointer>
#include <QScrollArea>
#include <QTimer>

struct RkPropertiesDock::Private {
    QPointer<RkNode> node;
    QScrollArea* scroll = nullptr;
    QTimer rebuildTimer;
    bool loading = false;
};

RkPropertiesDock::RkPropertiesDock(QWidget* parent)
    : QDockWidget(tr("Properties"), parent), d(std::make_unique<Private>())
{
    setObjectName(QStringLiteral("RkPropertiesDock"));
    d->scroll = new QScrollArea(this);
    d->scroll->setWidgetResizable(true);
    d->scroll->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    setWidget(d->scroll);

    d->rebuildTimer.setSingleShot(true);
    d->rebuildTimer.setInterval(0);
    connect(&d->rebuildTimer, &QTimer::timeout, this, &RkPropertiesDock::rebuild);
    if (rkScene) {
        connect(rkScene, &RkScene::primarySelectionChanged, this,
                &RkPropertiesDock::scheduleRebuild);
        connect(rkScene, &RkScene::sceneLoadStarting, this, [this] { d->loading = true; });
        connect(rkScene, &RkScene::sceneLoaded, this, [this] {
            d->loading = false;
            scheduleRebuild();
        });
    }
    rebuild();
}

RkPropertiesDock::~RkPropertiesDock() = default;

RkNode* RkPropertiesDock::shownNode() const
{
    return d->node;
}

void RkPropertiesDock::scheduleRebuild()
{
    if (!d->loading)
        d->rebuildTimer.start();
}

void RkPropertiesDock::rebuild()
{
    if (d->node)
        disconnect(d->node, nullptr, this, nullptr);
    d->node = rkScene ? rkScene->getPrimarySelection() : nullptr;

    auto* content = new QWidget;
    auto* layout = new RkWidgetListLayout(content);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);
    layout->setAlignment(Qt::AlignTop);
    if (!d->node) {
        auto* hint = new QLabel(tr("Select a node to see its properties."), content);
        hint->setAlignment(Qt::AlignCenter);
        hint->setEnabled(false);
        layout->addWidget(hint);
    } else {
        connect(d->node, &RkElement::propertyTreeChanged, this, &RkPropertiesDock::scheduleRebuild);
        // Walk the group tree depth first; every group with visible properties gets its widgets.
        QList<RkPropertyGroup*> pending;
        for (RkPropertyGroup* g = d->node->getPropertyGroups()->getFirstChild(); g;
             g = g->getNextSibling())
            pending.append(g);
        QList<RkWidgetGroup*> tops;
        while (!pending.isEmpty()) {
            RkPropertyGroup* group = pending.takeFirst();
            const QList<RkPropertyGroup*> children = group->getChildren();
            for (int i = children.size() - 1; i >= 0; --i)
                pending.prepend(children.at(i));
            for (RkProperty* property : group->getProperties()) {
                if (property->isHidden())
                    continue;
                RkClassFactory* factory = RkApp::findClassFactory(property->widgetClassName());
                QObject* made = factory ? factory->createInstance() : nullptr;
                auto* widget = qobject_cast<RkPropertyWgt*>(made);
                if (!widget) {
                    delete made;
                    continue;
                }
                const QString top = group->getPath().section(QLatin1Char('/'), 0, 0);
                const QString rest = group->getPath().section(QLatin1Char('/'), 1);
                RkWidgetGroup* topGroup = nullptr;
                for (RkWidgetGroup* t : tops) {
                    if (t->text() == top)
                        topGroup = t;
                }
                if (!topGroup) {
                    topGroup = new RkWidgetGroup(layout, top, QStringLiteral("WidgetGroup"), 0);
                    tops.append(topGroup);
                }
                RkWidgetGroup* target = rest.isEmpty() ? topGroup : topGroup->getGroup(rest, true);
                widget->addProperty(property);
                target->addWidget(widget);
            }
        }
        layout->addStretch(1);
    }
    // The old content goes with its widgets; none of them is on the stack here.
    delete d->scroll->takeWidget();
    d->scroll->setWidget(content);
}

RkPropertiesDock* rkAddPropertiesDock(RkMainWindow* window)
{
    auto* dock = new RkPropertiesDock(window);
    window->addDockWidget(Qt::LeftDockWidgetArea, dock);
    // The scene list needs less room than the properties.
    if (auto* scene = window->findChild<QDockWidget*>(QStringLiteral("SceneDock")))
        window->resizeDocks({scene, dock}, {1, 2}, Qt::Vertical);
    return dock;
}
