#pragma once

#include "rkcoreglobal.h"

#include <QListIterator>
#include <QWidget>

#include <memory>

class RkWidgetListLayout;

// A collapsible group in a list of widgets: a header (disclosure triangle and bold text on a
// darker strip; a click on it folds or unfolds the group) above a body that holds the group's
// sub-groups, indented, and below them the group's own widgets.
//
// Groups are pooled, not deleted: removeAllChildren() empties a group and deactivates all its
// sub-groups, and an inactive group is hidden and free for reuse. A group is deleted only with
// its parent widget, so a list that is rebuilt on every selection change keeps one set of group
// widgets and may hold pointers to them for as long as the list lives.
class RKCORE_EXPORT RkWidgetGroup : public QWidget
{
    Q_OBJECT
public:
    // A top-level group at the end of the layout, as a child of the layout's widget. The name is
    // the object name; depth is the nesting depth the header is shaded for (0 for a list's own
    // groups; sub-groups are one deeper than their parent).
    RkWidgetGroup(RkWidgetListLayout* layout, const QString& text, const QString& name,
                  int depth = 0);
    ~RkWidgetGroup() override;

    QString text() const;
    void setText(const QString& text);

    bool isCollapsed() const;
    // An inactive group is hidden; it is skipped by getGroup() look-ups and by hasChildren().
    bool isActive() const;
    void setActive(bool active);

    // The sub-group at a slash-separated path below this group ("Transforms/Rotation"; empty parts
    // are skipped, an empty path names this group). Only active groups match. With create, each
    // missing part is added after the active sub-groups of its parent: an inactive sub-group is
    // taken first (emptied, unfolded and renamed, without emitting collapsedChanged), otherwise a
    // new one is made. Without create a missing part gives null.
    RkWidgetGroup* getGroup(const QString& path, bool create);
    // Every direct sub-group, inactive ones included, in display order.
    int getNumGroups() const;
    RkWidgetGroup* getGroup(int index) const;
    // True when the group holds a widget or an active sub-group.
    bool hasChildren() const;
    // True when the widget is one of the group's own widgets.
    bool holdsWidget(const QWidget* widget) const;

    // Appends a widget below the group's sub-groups and shows it (also when it was hidden
    // before). The body becomes the widget's parent; a widget that is reparented elsewhere or
    // deleted leaves the group.
    void addWidget(QWidget* widget);
    // Empties the group: its widgets are hidden and handed back to the widget of the list layout
    // (never deleted: their owner may pool them), and every sub-group below is emptied and
    // deactivated the same way.
    virtual void removeAllChildren();
    // Hides inactive sub-groups and has the enclosing layouts recompute their sizes; call it after
    // a batch of changes. Works through the sub-groups too.
    void resetLayout();

    // For a list that is emptied and filled again at once: like removeAllChildren() followed by
    // setActive(false), but the widgets and sub-groups stay where they are, shown, until
    // settle(). A widget added back in its old place, or a sub-group taken again, is neither
    // moved nor hidden and shown again.
    void release();
    // Hides what release() left and nothing took back: widgets (they stay children of the group,
    // out of its layout) and inactive groups, this one included. Works through the sub-groups.
    void settle();

    // Moves a group found anywhere below this one to the end of its parent's sub-groups. False if
    // the group is not below this one.
    bool moveWidgetListGroupToEnd(RkWidgetGroup* group);

    // Java-style iterators over copies of the lists: the direct sub-groups (inactive ones included)
    // and the widgets, in display order.
    QListIterator<RkWidgetGroup*> groupListIterator() const;
    QListIterator<QWidget*> widgetListIterator() const;

public Q_SLOTS:
    // Folding hides the body with its widgets and sub-groups, which are kept; unfolding shows them
    // again, active sub-groups that were hidden included.
    void setCollapsed(bool collapsed);

Q_SIGNALS:
    // Emitted once per change, from setCollapsed() and from a click on the header.
    void collapsedChanged(bool collapsed);

private:
    RkWidgetGroup(RkWidgetGroup* parentGroup, const QString& text);
    void build(const QString& text, int depth);
    void makeFresh(const QString& text);
    void relayout();
    void aboutToShow();
    QList<QWidget*> liveWidgets() const;
    void pruneWidgets();

    struct Private;
    std::unique_ptr<Private> d;
};
