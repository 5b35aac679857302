#include "rkpropertypanelist.h"

#include "app/rkapp.h"
#include "plugin/rkclassfactory.h"
#include "properties/rkproperty.h"
#include "properties/rkpropertygroup.h"
#include "properties/rkpropertygrouptree.h"
#include "rklabelproperty.h"
#include "rklabelpropertywgt.h"
#include "rkpropertypanelistscrollevent.h"
#include "rktsimplearray.h"
#include "scene/rkbone.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "widgets/rkfloatpropertywgt.h"
#include "widgets/rkintpropertywgt.h"
#include "widgets/rkwidgetgroup.h"
#include "widgets/rkwidgetlistlayout.h"

#include <QApplication>
#include <QHash>
#include <QMouseEvent>
#include <QPointer>
#include <QScrollBar>
#include <QStyle>

#include <unordered_map>
#include <utility>

namespace
{

const QString LocalFavorites = QStringLiteral("Local Favorites");
const QString FigureFavorites = QStringLiteral("Figure Favorites");
const QString LabelWidgetClass = QStringLiteral("RkLabelPropertyWgt");
const QEvent::Type SettleEventType = QEvent::Type(QEvent::registerEventType());

// A pool holds at most this many widgets plus one.
constexpr int MaxPoolIndex = 768;
// One message per process, however many lists and pools reach the limit.
bool limitLogged = false;

QPointer<RkLabelProperty> localPlaceholder;
QPointer<RkLabelProperty> figurePlaceholder;

RkLabelProperty* placeholder(QPointer<RkLabelProperty>& slot, const QString& path)
{
    if (!slot) {
        slot = new RkLabelProperty(QString());
        rkRegisterStaticObject(slot);
        slot->setLabel(QStringLiteral("Right Click a Property to Add it Here"));
        slot->setPath(path);
    }
    return slot;
}

bool isFigureNode(const QObject* node)
{
    return qobject_cast<const RkBone*>(node) || qobject_cast<const RkSkeleton*>(node);
}

void setMouseOver(QWidget* widget, bool on)
{
    if (auto* floats = qobject_cast<RkFloatPropertyWgt*>(widget))
        floats->setIsMouseOverSlider(on);
    else if (auto* ints = qobject_cast<RkIntPropertyWgt*>(widget))
        ints->setIsMouseOverSlider(on);
}

// The editor widgets of one class. Widgets are handed out in creation order and all come back
// at once; they are never deleted while the list lives (the list's content widget owns them).
// A returned widget stays where it was, shown, so that a list filled alike puts it back in place
// at no cost; the list hides what it did not take back when the fill is finished.
class RkWidgetPool
{
public:
    RkWidgetPool(const QString& className, bool mouseOverSlider)
        : className(className), factory(RkApp::findClassFactory(className)),
          mouseOverSlider(mouseOverSlider)
    {
        isLabelPool = !factory && className == LabelWidgetClass;
    }

    void releaseAll()
    {
        for (int i = 0; i < used; ++i) {
            auto* widget = static_cast<RkPropertyWgt*>(widgets[i]);
            widget->removeAllProperties();
            widget->setSelected(false);
        }
        used = 0;
    }

    QWidget* acquire(QObject* list)
    {
        if (used < widgets.count()) {
            QWidget* widget = widgets[used];
            setMouseOver(widget, mouseOverSlider);
            ++used;
            return widget;
        }
        if (!factory && !isLabelPool)
            return nullptr;
        if (widgets.count() > MaxPoolIndex) {
            if (!limitLogged) {
                limitLogged = true;
                rkApp->log(QStringLiteral("Parameters list maximum size has been exceeded!"));
            }
            return nullptr;
        }
        QWidget* widget = nullptr;
        if (isLabelPool) {
            widget = new RkLabelPropertyWgt(nullptr, QString());
        } else {
            widget = qobject_cast<RkPropertyWgt*>(factory->createInstance());
            if (!widget)
                return nullptr;
            setMouseOver(widget, mouseOverSlider);
        }
        widget->installEventFilter(list);
        widgets.append(widget);
        ++used;
        return widget;
    }

    bool isLabelPool = false;
    QString className;
    RkClassFactory* factory = nullptr;
    int used = 0;
    RkTSimpleArray<QWidget*> widgets{16};
    bool mouseOverSlider = false;
};

using BuiltKey = std::pair<const RkWidgetGroup*, QString>;
struct BuiltKeyHash {
    size_t operator()(const BuiltKey& key) const
    {
        return std::hash<const void*>()(key.first) ^ qHash(key.second);
    }
};

struct RkGroupState {
    QString path;
    bool collapsed = false;
    bool visible = true;
};

// What the list looked like when a node was last shown.
struct RkListViewState {
    RkNode* node = nullptr; // compared by identity only
    int scrollPosition = 0;
    QList<RkGroupState> groupStates;
};

void saveGroupStates(RkWidgetGroup* group, const QString& path, QList<RkGroupState>& states)
{
    QListIterator<RkWidgetGroup*> it = group->groupListIterator();
    while (it.hasNext()) {
        RkWidgetGroup* child = it.next();
        if (!child->isActive())
            continue;
        const QString childPath = path + QLatin1Char('/') + child->text();
        states.append({childPath, child->isCollapsed(), !group->isCollapsed()});
        saveGroupStates(child, childPath, states);
    }
}

} // namespace

struct RkPropertyPaneList::Private {
    QWidget* centralWidget = nullptr;
    RkWidgetListLayout* layout = nullptr;
    QList<RkWidgetGroup*> groups;
    std::vector<std::unique_ptr<RkWidgetPool>> pools;
    // Each widget group forwards its folding to the property groups it shows in this build only.
    QList<QMetaObject::Connection> groupLinks;
    // The first widget of each label in each group in this build, for merging equal properties
    // of several nodes without scanning the group.
    std::unordered_map<BuiltKey, RkPropertyWgt*, BuiltKeyHash> built;
    // clear() left the earlier content in place; settle() hides what the build did not take.
    bool unsettled = false;
    bool settlePosted = false;

    std::vector<std::unique_ptr<RkListViewState>> viewStates;
    RkListViewState* currentViewState = nullptr;
    QList<QPointer<RkNode>> currentNodes;

    QPointer<RkPropertyWgt> anchor;
    int selectedCount = 0;
    bool rightClicked = false;

    bool showHidden = false;
    bool mouseOverSliders = false;
    QList<QPointer<RkProperty>> localFavorites;
    QList<QPointer<RkProperty>> figureFavorites;
    bool showFavorites = true;
    bool showAllGroups = true;
    QString filter;

    RkListViewState* findViewState(const RkNode* node) const
    {
        for (const auto& state : viewStates) {
            if (state->node == node)
                return state.get();
        }
        return nullptr;
    }
};

RkPropertyPaneList::RkPropertyPaneList(QWidget* parent, const QString& name)
    : QScrollArea(parent), d(std::make_unique<Private>())
{
    setObjectName(name);
    const int m = style()->pixelMetric(QStyle::PM_CustomBase);
    const int f = style()->pixelMetric(QStyle::PixelMetric(QStyle::PM_CustomBase + 64));
    setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    setViewportMargins(0, 0, m, 0);
    if (f < 1) {
        setFrameStyle(QFrame::NoFrame);
        setLineWidth(0);
    } else {
        setFrameStyle(QFrame::StyledPanel | QFrame::Sunken);
        setLineWidth(f);
    }

    d->centralWidget = new QWidget;
    setBackgroundRole(QPalette::Dark);
    setWidget(d->centralWidget);
    d->centralWidget->setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Minimum);

    d->layout = new RkWidgetListLayout(d->centralWidget);
    d->layout->setSizeConstraint(QLayout::SetMinAndMaxSize);
    d->layout->setContentsMargins(0, 0, 0, 0);
    d->layout->setSpacing(0);
    d->centralWidget->setLayout(d->layout);
    d->layout->setAlignment(Qt::AlignTop);
    setWidgetResizable(true);
}

RkPropertyPaneList::~RkPropertyPaneList() = default;

void RkPropertyPaneList::setShowFavorites(bool on)
{
    d->showFavorites = on;
}

void RkPropertyPaneList::setShowAllGroups(bool on)
{
    d->showAllGroups = on;
}

void RkPropertyPaneList::setFilter(const QString& text)
{
    d->filter = text;
}

void RkPropertyPaneList::setMouseOverSliders(bool on)
{
    d->mouseOverSliders = on;
}

void RkPropertyPaneList::resizeEvent(QResizeEvent* event)
{
    d->centralWidget->setFixedWidth(event->size().width());
    QScrollArea::resizeEvent(event);
}

void RkPropertyPaneList::updateCentralWidgetGeometry()
{
    d->centralWidget->updateGeometry();
}

RkWidgetGroup* RkPropertyPaneList::getGroup(const QString& path, bool create)
{
    QString top = path.startsWith(QLatin1Char('/')) ? path.mid(1) : path;
    QString rest;
    const int slash = top.indexOf(QLatin1Char('/'));
    if (slash >= 0) {
        rest = top.mid(slash + 1);
        top.truncate(slash);
    }

    RkWidgetGroup* match = nullptr;
    RkWidgetGroup* free = nullptr;
    for (RkWidgetGroup* group : qAsConst(d->groups)) {
        if (group->isActive()) {
            if (group->text() == top) {
                match = group;
                break;
            }
        } else if (!free) {
            free = group;
        }
    }
    if (!match) {
        if (!create)
            return nullptr;
        if (free) {
            match = free;
            match->setText(top);
            match->setActive(true);
        } else {
            match = new RkWidgetGroup(d->layout, top, QStringLiteral("WidgetGroup"), 0);
            d->groups.append(match);
        }
    }
    if (match->isHidden())
        d->layout->aboutToShow();
    match->show();
    return rest.isEmpty() ? match : match->getGroup(rest, create);
}

void RkPropertyPaneList::clear()
{
    for (const auto& pool : d->pools) {
        pool->releaseAll();
        pool->mouseOverSlider = d->mouseOverSliders;
    }
    for (const QMetaObject::Connection& link : qAsConst(d->groupLinks))
        disconnect(link);
    d->groupLinks.clear();
    d->built.clear(); // keeps its buckets for the next build
    // Groups and widgets stay shown until the fill is finished: those taken again in the same
    // place cost nothing. Should nobody finish the build, the event loop settles the list.
    d->layout->beginRefill();
    for (RkWidgetGroup* group : qAsConst(d->groups))
        group->release();
    d->unsettled = true;
    if (!d->settlePosted) {
        d->settlePosted = true;
        QApplication::postEvent(this, new QEvent(SettleEventType));
    }
    d->localFavorites.clear();
    d->figureFavorites.clear();
    d->anchor = nullptr;
    d->selectedCount = 0;
}

bool RkPropertyPaneList::addPropertyWidget(RkProperty* property, RkWidgetGroup* group,
                                           bool isFigureFavorite)
{
    // The favourites-only list holds nothing but its favourites groups.
    if (!isFigureFavorite && !d->showAllGroups && group->text() != LocalFavorites) {
        addToLocalFavorites(property, group);
        return false;
    }

    // The same property of several nodes shares one widget: the group's first widget of the
    // property's class whose first property has the same label.
    const QString cls = property->widgetClassName();
    const QString label = property->getLabel();
    const auto sameKind = [&cls, &label](const RkPropertyWgt* widget) {
        const RkProperty* first = widget->getFirstProperty();
        return first && first->getLabel() == label &&
               QLatin1String(widget->metaObject()->className()) == cls;
    };
    const BuiltKey key{group, label};
    const auto found = d->built.find(key);
    if (found != d->built.end()) {
        RkPropertyWgt* known = found->second;
        if (group->holdsWidget(known) && sameKind(known)) {
            known->addProperty(property);
            return true;
        }
        // Another class under the same label, or the group was emptied since: look it over.
        QListIterator<QWidget*> it = group->widgetListIterator();
        while (it.hasNext()) {
            auto* widget = qobject_cast<RkPropertyWgt*>(it.next());
            if (widget && sameKind(widget)) {
                widget->addProperty(property);
                return true;
            }
        }
        if (!group->holdsWidget(known))
            d->built.erase(key);
    }

    RkWidgetPool* pool = nullptr;
    for (const auto& candidate : d->pools) {
        if (candidate->className == cls) {
            pool = candidate.get();
            break;
        }
    }
    if (!pool) {
        d->pools.push_back(std::make_unique<RkWidgetPool>(cls, d->mouseOverSliders));
        pool = d->pools.back().get();
    }
    auto* widget = static_cast<RkPropertyWgt*>(pool->acquire(this));
    if (!widget)
        return false;
    // A new widget takes the list's font and style before it sizes its contents; a pooled one
    // stays in the group that last showed it until another group takes it.
    if (!widget->parentWidget())
        widget->setParent(d->centralWidget);
    widget->addProperty(property);
    group->addWidget(widget);
    d->built.emplace(key, widget); // the first of its label stays
    addToLocalFavorites(property, group);
    return true;
}

void RkPropertyPaneList::addToLocalFavorites(RkProperty* property, RkWidgetGroup* group)
{
    if (!d->showFavorites || !property->isFavorite() || group->text() == LocalFavorites)
        return;
    addPropertyWidget(property, getGroup(LocalFavorites, true), false);
    d->localFavorites.append(property);
}

bool RkPropertyPaneList::addPropertyGroups(RkPropertyGroupTree* tree, bool showHidden)
{
    d->showHidden = showHidden;
    if (d->showFavorites)
        moveGroupToEnd(getGroup(LocalFavorites, true));
    bool added = false;
    for (RkPropertyGroup* group = tree->getFirstChild(); group; group = group->getNextSibling())
        added = addPropertyGroup(group) || added;
    return added;
}

bool RkPropertyPaneList::moveGroupToEnd(RkWidgetGroup* group)
{
    if (d->groups.removeOne(group)) {
        d->groups.append(group);
        return true;
    }
    for (RkWidgetGroup* candidate : qAsConst(d->groups)) {
        if (candidate->moveWidgetListGroupToEnd(group))
            return true;
    }
    return false;
}

bool RkPropertyPaneList::addPropertyGroup(RkPropertyGroup* group)
{
    bool added = addGroupProperties(group);
    for (RkPropertyGroup* child = group->getFirstChild(); child; child = child->getNextSibling())
        added = addPropertyGroup(child) || added;
    if (added) {
        RkWidgetGroup* widgetGroup = getGroup(group->getPath(), true);
        widgetGroup->setCollapsed(group->getCollapsed());
        widgetGroup->resetLayout();
        d->groupLinks.append(connect(widgetGroup, &RkWidgetGroup::collapsedChanged, group,
                                     &RkPropertyGroup::setCollapsed));
    }
    return added;
}

bool RkPropertyPaneList::addGroupProperties(RkPropertyGroup* group)
{
    const QString path = group->getPath();
    if (!d->showFavorites && path == LocalFavorites)
        return false;

    if (d->showFavorites && !d->showAllGroups) {
        // The node's own groups never appear in the favourites-only list.
        for (RkProperty* property : group->getProperties()) {
            if (property->isHidden() && !d->showHidden)
                continue;
            if (property->isFavorite()) {
                addPropertyWidget(property, getGroup(LocalFavorites, true), false);
                d->localFavorites.append(property);
            }
        }
        return false;
    }

    RkWidgetGroup* widgetGroup = nullptr;
    for (RkProperty* property : group->getProperties()) {
        if (property->isHidden() && !d->showHidden)
            continue;
        if (!d->filter.isEmpty() && !property->getLabel().contains(d->filter, Qt::CaseInsensitive))
            continue;
        if (!widgetGroup)
            widgetGroup = getGroup(path, true);
        property->setPath(path);
        addPropertyWidget(property, widgetGroup, false);
    }
    return widgetGroup;
}

void RkPropertyPaneList::addFigureFavorites(RkPropertyGroupTree* tree, RkNode* node,
                                            bool showHidden)
{
    d->showHidden = showHidden;
    bool figure = false;
    if (d->showFavorites) {
        getGroup(LocalFavorites, true);
        if (isFigureNode(node)) {
            getGroup(FigureFavorites, true);
            figure = true;
        }
    }
    for (RkPropertyGroup* group = tree->getFirstChild(); group; group = group->getNextSibling())
        addFigureFavoriteGroup(group, node);
    if (figure) {
        RkWidgetGroup* favorites = getGroup(FigureFavorites, true);
        for (int i = 0; i < favorites->getNumGroups(); ++i) {
            if (!favorites->getGroup(i)->hasChildren())
                favorites->getGroup(i)->setActive(false);
        }
        favorites->resetLayout();
    }
}

static QString figureFavoritesPath(RkNode* node)
{
    const QString label =
        qobject_cast<RkSkeleton*>(node) ? QStringLiteral("Figure") : node->getLabel();
    return FigureFavorites + QStringLiteral("/%1/").arg(label);
}

bool RkPropertyPaneList::addFigureFavoriteGroup(RkPropertyGroup* group, RkNode* node)
{
    bool added = addGroupFigureFavorites(group, node);
    for (RkPropertyGroup* child = group->getFirstChild(); child; child = child->getNextSibling())
        added = addFigureFavoriteGroup(child, node) || added;
    if (added)
        getGroup(figureFavoritesPath(node), true)->resetLayout();
    return added;
}

bool RkPropertyPaneList::addGroupFigureFavorites(RkPropertyGroup* group, RkNode* node)
{
    if (!d->showFavorites)
        return false;
    bool added = false;
    for (RkProperty* property : group->getProperties()) {
        if (property->isHidden() && !d->showHidden)
            continue;
        if (property->isGlobalFavorite()) {
            addPropertyWidget(property, getGroup(figureFavoritesPath(node), true), true);
            d->figureFavorites.append(property);
            added = true;
        }
    }
    return added;
}

void RkPropertyPaneList::deactivateEmptySubGroups(const QString& path)
{
    RkWidgetGroup* group = getGroup(path, false);
    if (!group)
        return;
    for (int i = 0; i < group->getNumGroups(); ++i) {
        if (!group->getGroup(i)->hasChildren())
            group->getGroup(i)->setActive(false);
    }
}

void RkPropertyPaneList::finishBuild()
{
    d->layout->invalidate();
    d->layout->update();
    if (d->showFavorites && d->localFavorites.isEmpty()) {
        RkLabelProperty* local = placeholder(localPlaceholder, LocalFavorites);
        d->localFavorites.append(local);
        addPropertyWidget(local, getGroup(LocalFavorites, true), false);
    }

    bool figureSelected = false;
    RkNodeListIterator it = rkScene->selectedNodeListIterator();
    while (it.hasNext() && !figureSelected)
        figureSelected = isFigureNode(it.next());
    if (figureSelected) {
        if (d->showFavorites && d->figureFavorites.isEmpty()) {
            RkLabelProperty* figure = placeholder(figurePlaceholder, FigureFavorites);
            d->figureFavorites.append(figure);
            addPropertyWidget(figure, getGroup(FigureFavorites, true), true);
        }
    } else if (RkWidgetGroup* favorites = getGroup(FigureFavorites, false)) {
        favorites->setActive(false);
    }

    settle();
    d->centralWidget->setMinimumSize(d->layout->minimumSize());
    d->centralWidget->updateGeometry();
}

// Selection.

bool RkPropertyPaneList::eventFilter(QObject* watched, QEvent* event)
{
    auto* widget = qobject_cast<RkPropertyWgt*>(watched);
    if (event->type() != QEvent::MouseButtonPress || !widget)
        return QScrollArea::eventFilter(watched, event);

    // The press is never consumed: the widget still gets it.
    const auto* press = static_cast<QMouseEvent*>(event);
    if (press->button() == Qt::RightButton) {
        d->rightClicked = true;
        if (!widget->isSelected()) {
            clearSelection();
            select(widget, true);
        }
    } else if (press->modifiers() & Qt::ControlModifier) {
        select(widget, !widget->isSelected());
        d->anchor = widget;
    } else if (press->modifiers() & Qt::ShiftModifier) {
        selectRange(d->anchor, widget);
        d->anchor = widget;
    } else {
        clearSelection();
        select(widget, true);
        d->anchor = widget;
    }
    return false;
}

void RkPropertyPaneList::select(RkPropertyWgt* widget, bool on)
{
    widget->setSelected(on);
    d->selectedCount += on ? 1 : -1;
}

void RkPropertyPaneList::selectRange(RkPropertyWgt* a, RkPropertyWgt* b)
{
    bool inRange = false;
    for (RkWidgetGroup* group : qAsConst(d->groups)) {
        if (group->isActive() && selectRangeIn(group, a, b, inRange))
            return;
    }
}

// Walks the group depth first, sub-groups before the group's own widgets; true at the far end.
// With no anchor, or the anchor clicked again, the range runs to the end of the list.
bool RkPropertyPaneList::selectRangeIn(RkWidgetGroup* group, RkPropertyWgt* a, RkPropertyWgt* b,
                                       bool& inRange)
{
    QListIterator<RkWidgetGroup*> groups = group->groupListIterator();
    while (groups.hasNext()) {
        RkWidgetGroup* child = groups.next();
        if (child->isActive() && selectRangeIn(child, a, b, inRange))
            return true;
    }
    QListIterator<QWidget*> widgets = group->widgetListIterator();
    while (widgets.hasNext()) {
        QWidget* widget = widgets.next();
        auto* propertyWidget = qobject_cast<RkPropertyWgt*>(widget);
        if (widget == a || widget == b) {
            if (inRange) {
                select(propertyWidget, true);
                return true;
            }
            inRange = true;
        }
        if (inRange && propertyWidget)
            select(propertyWidget, true);
    }
    return false;
}

void RkPropertyPaneList::clearSelection()
{
    for (const auto& pool : d->pools) {
        for (int i = 0; i < pool->widgets.count(); ++i)
            static_cast<RkPropertyWgt*>(pool->widgets[i])->setSelected(false);
    }
    d->anchor = nullptr;
    d->selectedCount = 0;
    Q_EMIT selectionCleared();
}

QList<RkPropertyWgt*> RkPropertyPaneList::getSelectedWidgets() const
{
    QList<RkPropertyWgt*> selected;
    for (const auto& pool : d->pools) {
        for (int i = 0; i < pool->used; ++i) {
            auto* widget = static_cast<RkPropertyWgt*>(pool->widgets[i]);
            if (widget->isSelected())
                selected.append(widget);
        }
    }
    return selected;
}

bool RkPropertyPaneList::rightClicked() const
{
    return d->rightClicked;
}

void RkPropertyPaneList::clearRightClicked()
{
    d->rightClicked = false;
}

// Favourites.

bool RkPropertyPaneList::visitWidgets(
    RkWidgetGroup* group, const std::function<bool(RkWidgetGroup*, QWidget*)>& visit) const
{
    QListIterator<RkWidgetGroup*> groups = group->groupListIterator();
    while (groups.hasNext()) {
        RkWidgetGroup* child = groups.next();
        if (child->isActive() && visitWidgets(child, visit))
            return true;
    }
    QListIterator<QWidget*> widgets = group->widgetListIterator();
    while (widgets.hasNext()) {
        if (visit(group, widgets.next()))
            return true;
    }
    return false;
}

bool RkPropertyPaneList::visitWidgets(
    const std::function<bool(RkWidgetGroup*, QWidget*)>& visit) const
{
    for (RkWidgetGroup* group : qAsConst(d->groups)) {
        if (group->isActive() && visitWidgets(group, visit))
            return true;
    }
    return false;
}

void RkPropertyPaneList::setSelectedFlag(bool global, bool on)
{
    visitWidgets([&](RkWidgetGroup* group, QWidget* widget) {
        auto* propertyWidget = qobject_cast<RkPropertyWgt*>(widget);
        if (!propertyWidget || !propertyWidget->isSelected())
            return false;
        select(propertyWidget, false);
        // A widget shared by several nodes carries each node's property.
        for (RkProperty* property : propertyWidget->getProperties()) {
            if (global)
                property->setIsGlobalFavorite(on);
            else
                property->setIsFavorite(on);
        }
        // The figure favourite is gone from this group: hide it until the posted rebuild.
        if (global && !on)
            group->setActive(false);
        return false;
    });
}

void RkPropertyPaneList::setSelectedFavorite(bool on)
{
    setSelectedFlag(false, on);
}

void RkPropertyPaneList::setSelectedGlobalFavorite(bool on)
{
    setSelectedFlag(true, on);
}

void RkPropertyPaneList::scanSelection(bool& anyFigure, bool& anyLocal, bool& anyNone) const
{
    visitWidgets([&](RkWidgetGroup*, QWidget* widget) {
        auto* propertyWidget = qobject_cast<RkPropertyWgt*>(widget);
        RkProperty* property = propertyWidget ? propertyWidget->getFirstProperty() : nullptr;
        // Clicks select the widget, not its property: either counts as selected.
        if (property && (propertyWidget->isSelected() || property->isSelected())) {
            if (property->isGlobalFavorite())
                anyFigure = true;
            if (property->isFavorite())
                anyLocal = true;
            if (!property->isGlobalFavorite() && !property->isFavorite())
                anyNone = true;
        }
        return anyFigure && anyLocal && anyNone;
    });
}

// Remembered view state.

void RkPropertyPaneList::saveViewState()
{
    for (const QPointer<RkNode>& node : qAsConst(d->currentNodes)) {
        if (!node)
            continue;
        d->currentViewState = d->findViewState(node);
        if (!d->currentViewState) {
            d->viewStates.push_back(std::make_unique<RkListViewState>());
            d->currentViewState = d->viewStates.back().get();
            d->currentViewState->node = node;
        }
        d->currentViewState->scrollPosition = verticalScrollBar()->sliderPosition();
        QList<RkGroupState>& states = d->currentViewState->groupStates;
        states.clear();
        for (RkWidgetGroup* group : qAsConst(d->groups)) {
            if (!group->isActive())
                continue;
            states.append({group->text(), group->isCollapsed(), true});
            saveGroupStates(group, group->text(), states);
        }
    }
}

void RkPropertyPaneList::restoreViewState()
{
    d->currentNodes.clear();
    RkNodeListIterator it = rkScene->selectedNodeListIterator();
    while (it.hasNext()) {
        RkNode* node = it.next();
        d->currentNodes.append(node);
        // A node shown for the first time keeps the list as built; the nodes after it still
        // get theirs.
        d->currentViewState = d->findViewState(node);
        if (!d->currentViewState)
            continue;
        for (const RkGroupState& state : qAsConst(d->currentViewState->groupStates)) {
            // The pane carries the collapsed state of "Figure Favorites" itself.
            RkWidgetGroup* group = getGroup(state.path, false);
            if (!group || state.path == FigureFavorites)
                continue;
            group->setCollapsed(state.collapsed);
            group->setVisible(state.visible);
        }
        QApplication::postEvent(
            this, new RkPropertyPaneListScrollEvent(d->currentViewState->scrollPosition));
    }
}

void RkPropertyPaneList::settle()
{
    if (!d->unsettled)
        return;
    d->unsettled = false;
    for (RkWidgetGroup* group : qAsConst(d->groups))
        group->settle();
    d->layout->endRefill();
}

void RkPropertyPaneList::customEvent(QEvent* event)
{
    if (event->type() == SettleEventType) {
        d->settlePosted = false;
        if (d->unsettled) {
            settle();
            d->centralWidget->setMinimumSize(d->layout->minimumSize());
            d->centralWidget->updateGeometry();
        }
    } else if (event->type() == RkPropertyPaneListScrollEvent::EventType)
        verticalScrollBar()->setSliderPosition(
            static_cast<RkPropertyPaneListScrollEvent*>(event)->position());
    else
        QScrollArea::customEvent(event);
}

void RkPropertyPaneList::forgetAllViewStates()
{
    d->currentViewState = nullptr;
    d->viewStates.clear();
    d->currentNodes.clear();
}

void RkPropertyPaneList::forgetViewState(RkNode* node)
{
    // The node leaves currentNodes as well: the next save would otherwise file the list under an
    // address that a new node may be given.
    for (int i = d->currentNodes.size() - 1; i >= 0; --i) {
        if (!d->currentNodes.at(i) || d->currentNodes.at(i).data() == node)
            d->currentNodes.removeAt(i);
    }
    for (auto it = d->viewStates.begin(); it != d->viewStates.end(); ++it) {
        if ((*it)->node == node) {
            if (d->currentViewState == it->get())
                d->currentViewState = nullptr;
            d->viewStates.erase(it);
            break;
        }
    }
}
