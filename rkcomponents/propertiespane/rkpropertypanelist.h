#pragma once

#include <QScrollArea>

#include <functional>
#include <memory>

class RkNode;
class RkPropertyGroup;
class RkPropertyGroupTree;
class RkProperty;
class RkPropertyWgt;
class RkWidgetGroup;

// The scrolling list of the Parameters tab: the property groups of the selected nodes as
// collapsible widget groups with one editor widget per property. The same property of several
// nodes shares one widget. Groups and widgets are pooled, since the list is rebuilt on every
// selection change. With showFavorites the list adds "Local Favorites" and, for figures,
// "Figure Favorites"; with showAllGroups it lists every group of the nodes.
//
// The user picks widgets with clicks, Ctrl-clicks and Shift-clicks. For every node shown the list
// remembers the scroll position and the groups' states and brings them back when the node is
// shown again.
class RkPropertyPaneList : public QScrollArea
{
    Q_OBJECT
public:
    RkPropertyPaneList(QWidget* parent, const QString& name);
    ~RkPropertyPaneList() override;

    // Hands every widget back to its pool and deactivates every group. What the list showed stays
    // in place for the next fill to take back; finishBuild() hides the rest (or, without one, the
    // event loop does).
    virtual void clear();

    void setShowFavorites(bool on);
    void setShowAllGroups(bool on);
    void setMouseOverSliders(bool on);
    // Non-empty: the node groups list only the properties whose label holds the text (any case).
    void setFilter(const QString& text);

    // Filling, after clear(): true when a group of the tree got a widget.
    bool addPropertyGroups(RkPropertyGroupTree* tree, bool showHidden);
    void addFigureFavorites(RkPropertyGroupTree* tree, RkNode* node, bool showHidden);
    void finishBuild();
    void deactivateEmptySubGroups(const QString& path);
    // The active group at a slash-separated path ("Transforms/Rotation"), made when create is set.
    RkWidgetGroup* getGroup(const QString& path, bool create);

    void clearSelection();
    QList<RkPropertyWgt*> getSelectedWidgets() const;
    // A right press reached a property widget of this list since the flag was last cleared.
    bool rightClicked() const;
    void clearRightClicked();

    // Favourite flags of the selected widgets' properties; the widgets are deselected. Removing
    // figure favourites deactivates the groups that held them until the next rebuild.
    void setSelectedFavorite(bool on);
    void setSelectedGlobalFavorite(bool on);
    // Sets (never clears) anyFigure, anyLocal and anyNone from the selected widgets' first
    // properties, so calls on two lists add up.
    void scanSelection(bool& anyFigure, bool& anyLocal, bool& anyNone) const;

    // Around a rebuild: save before clear(), restore after the list was filled.
    void saveViewState();
    void restoreViewState();
    void forgetAllViewStates();
    void forgetViewState(RkNode* node);

    bool eventFilter(QObject* watched, QEvent* event) override;

public Q_SLOTS:
    void updateCentralWidgetGeometry();

Q_SIGNALS:
    void selectionCleared();

protected:
    void customEvent(QEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;

private:
    bool addPropertyWidget(RkProperty* property, RkWidgetGroup* group, bool isFigureFavorite);
    void addToLocalFavorites(RkProperty* property, RkWidgetGroup* group);
    bool addPropertyGroup(RkPropertyGroup* group);
    bool addGroupProperties(RkPropertyGroup* group);
    bool addFigureFavoriteGroup(RkPropertyGroup* group, RkNode* node);
    bool addGroupFigureFavorites(RkPropertyGroup* group, RkNode* node);
    bool moveGroupToEnd(RkWidgetGroup* group);
    void settle();
    void select(RkPropertyWgt* widget, bool on);
    void selectRange(RkPropertyWgt* a, RkPropertyWgt* b);
    // Calls visit for each widget of the active groups, sub-groups first, until it returns true.
    bool visitWidgets(RkWidgetGroup* group,
                      const std::function<bool(RkWidgetGroup*, QWidget*)>& visit) const;
    bool visitWidgets(const std::function<bool(RkWidgetGroup*, QWidget*)>& visit) const;
    void setSelectedFlag(bool global, bool on);
    bool selectRangeIn(RkWidgetGroup* group, RkPropertyWgt* a, RkPropertyWgt* b, bool& inRange);

    struct Private;
    std::unique_ptr<Private> d;
};
