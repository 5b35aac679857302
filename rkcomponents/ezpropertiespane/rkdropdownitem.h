#pragma once

#include <QModelIndex>
#include <QObject>
#include <QPointer>

class QComboBox;
class RkDropDownView;

// One level of a drop-down view: the combo box that lists the children of parentIndex.
class RkDropDownItem : public QObject
{
    Q_OBJECT
public:
    RkDropDownItem(RkDropDownView* view, int level, QModelIndex parentIndex);
    // The combo box goes later, as the choice that dropped this level may still be on the stack.
    ~RkDropDownItem() override;

    RkDropDownView* view = nullptr;
    int level = 0;
    // Guarded: a view destroyed before a dropped level's deferred delete takes the box with it.
    QPointer<QComboBox> combo;
    // Persistent, so that a model reset before the view's next layout leaves no dangling index.
    QPersistentModelIndex parentIndex;

public Q_SLOTS:
    virtual void currentIndexChanged(int index);
};
