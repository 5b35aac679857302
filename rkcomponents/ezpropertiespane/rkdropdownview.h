#pragma once

#include <QAbstractItemView>
#include <QVector>

class QVBoxLayout;
class RkDropDownItem;

// A tree model shown as the path from the root to the chosen item: one combo box per level, each
// listing the children of the item chosen above it. Every change of choice is reported with
// activated(index) for the item now chosen (the root when nothing is).
class RkDropDownView : public QAbstractItemView
{
    Q_OBJECT
public:
    explicit RkDropDownView(QWidget* parent = nullptr);
    ~RkDropDownView() override;

    QRect visualRect(const QModelIndex& index) const override;
    void scrollTo(const QModelIndex& index, ScrollHint hint = EnsureVisible) override;
    QModelIndex indexAt(const QPoint& point) const override;
    QSize minimumSizeHint() const override;
    QSize sizeHint() const override;

public Q_SLOTS:
    // Rebuilds from the root; Qt calls it after setModel(), a model reset or reset().
    void doItemsLayout() override;
    virtual void madeChoice(int itemIndex, int choiceIndex);

protected:
    // Drops the levels below itemIndex, then lists the children of row choiceRow of that level
    // in a new level; a choiceRow of -1 (the placeholder) only steps the choice back up.
    virtual void buildLevel(int itemIndex, int choiceRow, QString placeholder);

    QModelIndex moveCursor(CursorAction cursorAction, Qt::KeyboardModifiers modifiers) override;
    int horizontalOffset() const override;
    int verticalOffset() const override;
    bool isIndexHidden(const QModelIndex& index) const override;
    void setSelection(const QRect& rect, QItemSelectionModel::SelectionFlags command) override;
    QRegion visualRegionForSelection(const QItemSelection& selection) const override;

private:
    void fitHeight();
    int rowHeight() const;

    QVBoxLayout* levelLayout = nullptr;
    QVector<RkDropDownItem*> items;
};
