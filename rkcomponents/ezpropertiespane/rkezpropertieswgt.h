#pragma once

#include <QModelIndex>
#include <QPointer>
#include <QVector>
#include <QWidget>

#include <memory>

class QLabel;
class QLineEdit;
class QStackedLayout;
class QStandardItem;
class QStandardItemModel;
class QTimer;
class RkDropDownView;
class RkEzMixerWgt;
class RkEzMixers;
class RkEzPropertiesControl;
class RkEzPropertiesPage;
class RkEzTabBar;
class RkNode;
class RkProperty;
class RkPropertyGroup;

// The body of the Shape tab. It follows the scene's primary selection (through a 20 ms
// single-shot timer, quiet while a scene loads or clears), offers the figure's categories of
// morphs in a chooser, shows the chosen category's morphs as pages behind an upper row of tabs and
// the figure's custom mixers behind a lower row that ends in "+". The two rows act as one
// selection. A filter beside the chooser narrows the chosen category and everything below it to
// the morphs whose label contains the text, on one page.
class RkEzPropertiesWgt : public QWidget
{
    Q_OBJECT
public:
    explicit RkEzPropertiesWgt(QWidget* parent = nullptr);
    ~RkEzPropertiesWgt() override;

    int getMode() const;
    RkDropDownView* getCategoryView() const;
    QStandardItemModel* getCategoryModel() const;
    QLineEdit* getFilterEdit() const;
    RkEzTabBar* getUpperTabs() const;
    RkEzTabBar* getLowerTabs() const;
    QStackedLayout* getStack() const;
    QVector<RkEzPropertiesPage*> getPages() const;
    QVector<RkEzMixerWgt*> getMixerPages() const;
    // The page the upper tabs show now.
    RkEzPropertiesPage* getCurrentPage() const;
    RkNode* getFigure() const;
    // How many times the timer rebuilt the categories for a new selection.
    int getRebuildCount() const;

    // A tile was dropped on the drop target: it becomes a control of the current mixer (a new
    // one when there is none).
    void addControlToMixer(RkEzPropertiesControl* tile);

public Q_SLOTS:
    void setMode(int mode);

private Q_SLOTS:
    void primarySelectionChanged(RkNode* node);
    void startTimer();
    void timeoutTimer();
    void blockTimer();
    void unblockTimer();
    void viewActivated(QModelIndex index);
    void upperTabChanged(int index);
    void lowerTabChanged(int index);
    void lowerTabContextMenu(const QPoint& pos);
    void lowerTabRemove();
    void filterChanged();

private:
    bool buildCategoryItems(RkPropertyGroup* first, QStandardItem* parent);
    void showCategory(const QString& path);
    void rebuildMixerPages(RkNode* newFigure);
    RkEzMixerWgt* addMixerPage();
    void watchShownNode(RkNode* node);
    void shownNodeDestroyed();

    struct Private;
    std::unique_ptr<Private> d;
};
