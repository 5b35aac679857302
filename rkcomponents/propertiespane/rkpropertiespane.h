#pragma once

#include "panes/rkpane.h"

#include <QPointer>

#include <memory>

class RkPropertyPaneList;

// The Parameters tab: a caption naming the selection, the favourites list, a divider bar that
// resizes or folds it, and the list of the selected nodes' properties. Follows the selection
// through one posted refresh however many changes come before it; waits out scene loads.
class RkPropertiesPane : public RkPane
{
    Q_OBJECT
public:
    // Type of the posted refresh event.
    static constexpr int RefreshEvent = 1004;

    RkPropertiesPane();
    ~RkPropertiesPane() override;

    RkPropertyPaneList* getFavoritesList() const;
    RkPropertyPaneList* getPropertiesList() const;

    // The pane of the current main window, kept in cache while it lives; looked up again while
    // the cache is empty.
    static RkPropertiesPane* find(QPointer<RkPropertiesPane>& cache);

    // Shows the favourites menu for the selected property widgets of both lists.
    void showFavoritesMenu();

    void restoreSettings(const RkPaneSettings& settings) override;
    void buildOptionsMenu(RkActionMenu* menu) const override;
    int getOptionsMenuVersion() const override;
    void saveSettings(RkPaneSettings& settings) const override;

public Q_SLOTS:
    virtual void toggleShowHidden();
    virtual void toggleMouseOverSlider();
    virtual void showHidden(bool onOff);
    virtual void setMouseOverSlider(bool onOff);
    bool showingHidden() const;
    bool isSliderMouseOver() const;
    void adjustFavsListHeight(int amount);
    void toggleFavsListHeight();
    void setFavsListHeight(bool minimize, int h);
    void refresh() override;
    // Asks for one refresh, posted (the favourites actions use it after changing flags).
    void updateSelection();

Q_SIGNALS:
    void showingHiddenChanged(bool onOff);
    void mouseOverSliderChanged(bool onOff);
    // After each rebuild of the lists (a selection change, a refresh).
    void listsRebuilt();

protected:
    bool event(QEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;

private Q_SLOTS:
    void needRefresh();
    void blockRefresh();
    void unblockRefresh();
    void nodeDeleted(QObject* object);
    void propertySelectionCleared();
    void sceneCleared();

private:
    void rebuildNodeList();
    void rebuildLists();
    void layoutChildren();

    struct Private;
    std::unique_ptr<Private> d;
};
