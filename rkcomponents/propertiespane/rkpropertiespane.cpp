#include "rkpropertiespane.h"

#include "actions/rkactionmenu.h"
#include "actions/rkactionmgr.h"
#include "actions/rkhelpmgr.h"
#include "app/rkapp.h"
#include "app/rkmainwindow.h"
#include "panes/rkpanemgr.h"
#include "panes/rkpanesettings.h"
#include "properties/rkproperty.h"
#include "rkpropertypanelist.h"
#include "scene/rkbone.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "widgets/rkdividerbar.h"
#include "widgets/rkwidgetgroup.h"

#include <QCoreApplication>
#include <QCursor>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QMouseEvent>
#include <QScrollBar>
#include <QStyle>

namespace
{

const QString figureFavorites = QStringLiteral("Figure Favorites");

int customMetric(const QWidget* widget, int offset)
{
    return widget->style()->pixelMetric(QStyle::PixelMetric(QStyle::PM_CustomBase + offset));
}

bool isFigurePart(const RkNode* node)
{
    return qobject_cast<const RkBone*>(node) || qobject_cast<const RkSkeleton*>(node);
}

RkActionMenu* subMenu(const QStringList& entries)
{
    auto* menu = new RkActionMenu;
    for (const QString& entry : entries) {
        if (entry.isEmpty())
            menu->insertSeparator();
        else
            menu->insertAction(entry);
    }
    return menu;
}

} // namespace

struct RkPropertiesPane::Private {
    QList<RkNode*> nodes;
    QLabel* selectedItemCaption = nullptr;
    QLabel* selectedItemLabel = nullptr;
    RkPropertyPaneList* favoritesList = nullptr;
    RkPropertyPaneList* propertiesList = nullptr;
    RkDividerBar* favoritesDivider = nullptr;
    QLineEdit* filterField = nullptr;
    // The filter of the last build: the view state is remembered only of unfiltered lists.
    QString builtFilter;
    // Owned by the event queue until delivered.
    QEvent* pendingRefresh = nullptr;
    bool refreshBlocked = false;
    bool showingHidden = false;
    bool mouseOverSliders = true;
    int favsHeight = 100;
    bool favsMinimized = false;
    bool figureFavsCollapsed = false;
};

RkPropertiesPane::RkPropertiesPane() : RkPane(tr("Parameters")), d(std::make_unique<Private>())
{
    d->selectedItemCaption = new QLabel(tr("Selected Item:"), this);
    d->selectedItemLabel = new QLabel(this);

    d->favoritesList = new RkPropertyPaneList(this, QStringLiteral("FavoritesList"));
    d->favoritesList->hide();
    d->favoritesList->setMinimumSize(200, 90);
    d->favoritesList->setShowFavorites(true);
    d->favoritesList->setShowAllGroups(false);

    d->favoritesDivider = new RkDividerBar(this, Qt::Horizontal, QStringLiteral("FavoritesDivider"),
                                           RkDividerBar::GripToggleBar);
    d->favoritesDivider->enableToggleBar(true);
    d->favoritesDivider->hide();
    connect(d->favoritesDivider, &RkDividerBar::toggleBarActivated, this,
            &RkPropertiesPane::toggleFavsListHeight);
    connect(d->favoritesDivider, &RkDividerBar::moved, this,
            &RkPropertiesPane::adjustFavsListHeight);

    d->filterField = new QLineEdit(this);
    d->filterField->setObjectName(QStringLiteral("FilterField"));
    d->filterField->setPlaceholderText(tr("Filter parameters"));
    // No clear button: its fade animation leaks when the field goes while it runs.
    d->filterField->setClearButtonEnabled(false);
    connect(d->filterField, &QLineEdit::textChanged, this, &RkPropertiesPane::needRefresh);

    d->propertiesList = new RkPropertyPaneList(this, QStringLiteral("PropertiesList"));
    d->propertiesList->setMinimumSize(200, 75);
    d->propertiesList->setShowFavorites(false);
    d->propertiesList->setShowAllGroups(true);

    connect(d->propertiesList, &RkPropertyPaneList::selectionCleared, this,
            &RkPropertiesPane::propertySelectionCleared);
    connect(d->favoritesList, &RkPropertyPaneList::selectionCleared, this,
            &RkPropertiesPane::propertySelectionCleared);
    connect(rkScene, &RkScene::nodeSelectionListChanged, this, &RkPropertiesPane::updateSelection);
    connect(rkScene, &RkScene::sceneLoadStarting, this, &RkPropertiesPane::blockRefresh);
    connect(rkScene, &RkScene::sceneLoaded, this, &RkPropertiesPane::unblockRefresh);
    connect(rkScene, &RkScene::sceneCleared, this, &RkPropertiesPane::sceneCleared);
    RkHelpMgr::setOnlineHelp(d->propertiesList);
    RkHelpMgr::setOnlineHelp(d->favoritesList);

    rebuildNodeList();
    setMinimumSize(200, 150);
    layoutChildren();
}

RkPropertiesPane::~RkPropertiesPane() = default;

RkPropertyPaneList* RkPropertiesPane::getFavoritesList() const
{
    return d->favoritesList;
}

RkPropertyPaneList* RkPropertiesPane::getPropertiesList() const
{
    return d->propertiesList;
}

RkPropertiesPane* RkPropertiesPane::find(QPointer<RkPropertiesPane>& cache)
{
    if (!cache && rkApp && rkApp->getInterface()) {
        cache = qobject_cast<RkPropertiesPane*>(
            rkApp->getInterface()->getPaneMgr()->findPane(QStringLiteral("RkPropertiesPane")));
    }
    return cache;
}

// Refresh.

void RkPropertiesPane::updateSelection()
{
    if (d->refreshBlocked || d->pendingRefresh || !rkApp || !rkApp->isRunning())
        return;
    d->pendingRefresh = new QEvent(QEvent::Type(RefreshEvent));
    QCoreApplication::postEvent(this, d->pendingRefresh);
}

void RkPropertiesPane::needRefresh()
{
    updateSelection();
}

void RkPropertiesPane::blockRefresh()
{
    d->refreshBlocked = true;
}

void RkPropertiesPane::unblockRefresh()
{
    d->refreshBlocked = false;
    updateSelection();
}

bool RkPropertiesPane::event(QEvent* event)
{
    if (event->type() == RefreshEvent) {
        refresh();
        d->pendingRefresh = nullptr;
        return true;
    }
    return RkPane::event(event);
}

void RkPropertiesPane::refresh()
{
    if (d->refreshBlocked)
        return;
    rebuildNodeList();
    rebuildLists();
    layoutChildren();
    update();
}

void RkPropertiesPane::resizeEvent(QResizeEvent* event)
{
    RkPane::resizeEvent(event);
    rebuildLists();
    layoutChildren();
}

void RkPropertiesPane::rebuildNodeList()
{
    for (RkNode* node : qAsConst(d->nodes))
        disconnect(node, nullptr, this, nullptr);
    d->nodes.clear();

    RkNodeListIterator it = rkScene->selectedNodeListIterator();
    while (it.hasNext()) {
        RkNode* node = it.next();
        d->nodes.append(node);
        connect(node, &RkElement::labelChanged, this, &RkPropertiesPane::updateSelection);
        connect(node, &RkElement::propertyTreeChanged, this, &RkPropertiesPane::needRefresh);
        connect(node, &QObject::destroyed, this, &RkPropertiesPane::nodeDeleted);
    }

    if (d->nodes.isEmpty()) {
        d->selectedItemLabel->setText(tr("<None>"));
    } else if (d->nodes.size() > 1) {
        d->selectedItemLabel->setText(tr("<Multiple>"));
    } else {
        RkNode* node = d->nodes.first();
        QString text = node->getLabel();
        if (qobject_cast<RkBone*>(node) && node->getSkeleton())
            text = node->getSkeleton()->getLabel() + QStringLiteral(" : ") + text;
        d->selectedItemLabel->setText(text);
    }
}

void RkPropertiesPane::rebuildLists()
{
    // The lists stay shown while they are rebuilt: hiding and showing them would visit every
    // widget, while a widget that comes back in its place costs nothing. Nothing is drawn before
    // the event loop runs again, after the build.
    d->favoritesDivider->hide();
    RkApp::setBusyCursor();

    if (RkWidgetGroup* group = d->favoritesList->getGroup(figureFavorites, false))
        d->figureFavsCollapsed = group->isCollapsed();

    const QString filter = d->filterField->text().trimmed();
    for (RkPropertyPaneList* list : {d->propertiesList, d->favoritesList}) {
        list->setMouseOverSliders(d->mouseOverSliders);
        if (list == d->favoritesList || d->builtFilter.isEmpty())
            list->saveViewState();
        list->clear();
    }
    d->propertiesList->setFilter(filter);
    d->builtFilter = filter;

    for (RkNode* node : qAsConst(d->nodes)) {
        d->propertiesList->addPropertyGroups(node->getPropertyGroups(), d->showingHidden);
        if (RkSkeleton* skeleton = isFigurePart(node) ? node->getSkeleton() : nullptr) {
            QList<RkBone*> bones;
            skeleton->getAllBones(bones);
            for (RkBone* bone : qAsConst(bones)) {
                d->favoritesList->addFigureFavorites(bone->getPropertyGroups(), bone,
                                                     d->showingHidden);
            }
            d->favoritesList->addFigureFavorites(skeleton->getPropertyGroups(), skeleton,
                                                 d->showingHidden);
        }
        d->favoritesList->addPropertyGroups(node->getPropertyGroups(), d->showingHidden);
        d->favoritesList->finishBuild();
        d->favoritesList->deactivateEmptySubGroups(figureFavorites);
    }

    d->propertiesList->show();
    d->propertiesList->finishBuild();
    // A folded favourites list stays folded, also in rebuilds that do not lay out again.
    d->favoritesList->setVisible(!d->nodes.isEmpty() && !d->favsMinimized);
    d->favoritesDivider->setVisible(!d->nodes.isEmpty());

    // A filtered list starts at its top; clearing the filter brings the remembered view back.
    if (filter.isEmpty())
        d->propertiesList->restoreViewState();
    else
        d->propertiesList->verticalScrollBar()->setValue(0);
    d->favoritesList->restoreViewState();

    if (RkWidgetGroup* group = d->favoritesList->getGroup(figureFavorites, false))
        group->setCollapsed(d->figureFavsCollapsed);
    Q_EMIT listsRebuilt();
    RkApp::clearBusyCursor();
}

void RkPropertiesPane::layoutChildren()
{
    const int w = width();
    const int h = height();
    const int m = customMetric(this, 0);
    const int r = customMetric(this, 10);
    const int dividerHeight = customMetric(this, 17);

    // The caption is 80 wide and the name starts at 80, overlapping the caption's margin; a font
    // whose caption text needs more room widens the caption and moves the name after it.
    const int textWidth = d->selectedItemCaption->sizeHint().width();
    const int captionWidth = qMax(80, textWidth);
    const int labelX = m + textWidth <= 80 ? 80 : m + textWidth + m;
    d->selectedItemCaption->setGeometry(m, m, captionWidth, r);
    d->selectedItemLabel->setGeometry(labelX, m, qMax(w - 2 * m - labelX, 0), r);

    int y = 2 * m + r;
    if (!d->favsMinimized) {
        d->favoritesList->setGeometry(m, y, w - 2 * m, d->favsHeight);
        y += d->favsHeight;
    } else {
        d->favoritesList->hide();
    }
    d->favoritesDivider->setGeometry(m, y, w - 2 * m, dividerHeight);
    y += dividerHeight;
    const int filterHeight = d->filterField->sizeHint().height();
    d->filterField->setGeometry(m, y, w - 2 * m, filterHeight);
    y += filterHeight + m;
    d->propertiesList->setGeometry(m, y, w - 2 * m, h - 1 - m - y);
}

// Switches.

void RkPropertiesPane::toggleShowHidden()
{
    showHidden(!d->showingHidden);
}

void RkPropertiesPane::toggleMouseOverSlider()
{
    setMouseOverSlider(!d->mouseOverSliders);
}

void RkPropertiesPane::showHidden(bool onOff)
{
    if (onOff == d->showingHidden)
        return;
    d->showingHidden = onOff;
    rebuildLists();
    Q_EMIT showingHiddenChanged(onOff);
}

void RkPropertiesPane::setMouseOverSlider(bool onOff)
{
    if (onOff == d->mouseOverSliders)
        return;
    d->mouseOverSliders = onOff;
    rebuildLists();
    Q_EMIT mouseOverSliderChanged(onOff);
}

bool RkPropertiesPane::showingHidden() const
{
    return d->showingHidden;
}

bool RkPropertiesPane::isSliderMouseOver() const
{
    return d->mouseOverSliders;
}

// Favourites list height.

void RkPropertiesPane::toggleFavsListHeight()
{
    d->favsMinimized = !d->favsMinimized;
    d->favoritesList->setVisible(!d->favsMinimized);
    layoutChildren();
}

void RkPropertiesPane::setFavsListHeight(bool minimize, int h)
{
    if (minimize != d->favsMinimized)
        toggleFavsListHeight();
    d->favsHeight = qMax(0, h);
    layoutChildren();
}

void RkPropertiesPane::adjustFavsListHeight(int amount)
{
    if (!d->favsMinimized)
        setFavsListHeight(false, d->favsHeight + amount);
}

// Selection and scene.

void RkPropertiesPane::propertySelectionCleared()
{
    RkPropertyPaneList* other = nullptr;
    if (sender() == d->propertiesList)
        other = d->favoritesList;
    else if (sender() == d->favoritesList)
        other = d->propertiesList;
    if (!other)
        return;
    const bool wasBlocked = other->blockSignals(true);
    other->clearSelection();
    other->blockSignals(wasBlocked);
}

void RkPropertiesPane::sceneCleared()
{
    d->propertiesList->forgetAllViewStates();
    d->favoritesList->forgetAllViewStates();
}

// The node is half destroyed here: it is only compared, never used.
void RkPropertiesPane::nodeDeleted(QObject* object)
{
    RkNode* deleted = nullptr;
    for (int i = d->nodes.size() - 1; i >= 0; --i) {
        if (static_cast<QObject*>(d->nodes.at(i)) == object)
            deleted = d->nodes.takeAt(i);
    }
    if (!deleted)
        return;
    d->propertiesList->forgetViewState(deleted);
    d->favoritesList->forgetViewState(deleted);
}

void RkPropertiesPane::mousePressEvent(QMouseEvent* event)
{
    if (d->refreshBlocked || d->pendingRefresh) {
        event->ignore();
        return;
    }
    event->accept();
    if (event->button() == Qt::RightButton &&
        (d->propertiesList->rightClicked() || d->favoritesList->rightClicked())) {
        d->propertiesList->clearRightClicked();
        d->favoritesList->clearRightClicked();
        showFavoritesMenu();
    }
}

void RkPropertiesPane::showFavoritesMenu()
{
    const bool figure = std::any_of(d->nodes.cbegin(), d->nodes.cend(), isFigurePart);
    bool anyFigure = false;
    bool anyLocal = false;
    bool anyNone = false;
    d->propertiesList->scanSelection(anyFigure, anyLocal, anyNone);
    d->favoritesList->scanSelection(anyFigure, anyLocal, anyNone);
    if (d->nodes.isEmpty())
        return;

    const bool addFigure = figure && (!anyFigure || anyNone);
    const bool removeFigure = figure && anyFigure;
    const bool addLocal = !anyLocal || anyNone;
    const bool removeLocal = anyLocal;
    if (!addFigure && !removeFigure && !addLocal && !removeLocal)
        return;

    RkActionMgr* actions = rkApp->getInterface()->getActionMgr();
    QPointer<QMenu> menu = new QMenu(this);
    if (addFigure)
        actions->addActionToMenu(QStringLiteral("RkGlobalFavoritesAddAction"), menu);
    if (addLocal)
        actions->addActionToMenu(QStringLiteral("RkFavoritesAddAction"), menu);
    if ((addFigure || addLocal) && (removeFigure || removeLocal))
        menu->addSeparator();
    if (removeFigure)
        actions->addActionToMenu(QStringLiteral("RkGlobalFavoritesRemoveAction"), menu);
    if (removeLocal)
        actions->addActionToMenu(QStringLiteral("RkFavoritesRemoveAction"), menu);
    menu->exec(QCursor::pos());
    delete menu;
}

// Settings and options menu.

void RkPropertiesPane::restoreSettings(const RkPaneSettings& settings)
{
    showHidden(settings.getBoolValue(QStringLiteral("ShowHidden"), false));
    // Missing, the key turns mouse-over sliders off although a new pane starts with them on.
    setMouseOverSlider(settings.getBoolValue(QStringLiteral("MouseOverSliders"), false));
    if (settings.getBoolValue(QStringLiteral("MinimizeFavorites"), false) != d->favsMinimized)
        toggleFavsListHeight();
}

void RkPropertiesPane::saveSettings(RkPaneSettings& settings) const
{
    settings.setBoolValue(QStringLiteral("ShowHidden"), d->showingHidden);
    settings.setBoolValue(QStringLiteral("MouseOverSliders"), d->mouseOverSliders);
    settings.setBoolValue(QStringLiteral("MinimizeFavorites"), d->favsMinimized);
}

void RkPropertiesPane::buildOptionsMenu(RkActionMenu* menu) const
{
    // The posing actions belong to the host; the menu names them only.
    const QStringList kinds = {QStringLiteral("Figure"),        QStringLiteral("FigurePose"),
                               QStringLiteral("FigureMorphs"),  QString(),
                               QStringLiteral("SelectedItems"), QStringLiteral("Transforms")};
    const QList<QPair<QString, QString>> verbs = {{QStringLiteral("Memorize"), "Memorize"},
                                                  {QStringLiteral("Restore"), "Restore"},
                                                  {QStringLiteral("Zero"), "Zero"},
                                                  {QStringLiteral("Clear Animation"), "ClearKeys"}};
    for (const auto& verb : verbs) {
        QStringList entries;
        for (const QString& kind : kinds)
            entries.append(kind.isEmpty() ? QString()
                                          : QStringLiteral("Rk%1%2Action").arg(verb.second, kind));
        menu->insertMenu(verb.first, subMenu(entries));
    }
    menu->insertSeparator();
    menu->insertMenu(QStringLiteral("Limits"), subMenu({QStringLiteral("RkLimitsOnAction"),
                                                        QStringLiteral("RkLimitsOffAction")}));
    menu->insertMenu(
        QStringLiteral("Lock"),
        subMenu({QStringLiteral("RkLockNodeAction"), QStringLiteral("RkUnlockNodeAction"),
                 QString(), QStringLiteral("RkLockMorphsAction"),
                 QStringLiteral("RkUnlockMorphsAction"), QString(),
                 QStringLiteral("RkLockTransformsAction"),
                 QStringLiteral("RkUnlockTransformsAction")}));
    menu->insertSeparator();
    menu->insertAction(QStringLiteral("RkSymmetryAction"));
    menu->insertSeparator();
    menu->insertAction(QStringLiteral("RkMoveToFloorAction"));
    menu->insertSeparator();
    menu->insertAction(QStringLiteral("RkShowHiddenPropAction"));
    menu->insertAction(QStringLiteral("RkMouseOverSliderAction"));
}

int RkPropertiesPane::getOptionsMenuVersion() const
{
    return 5;
}
