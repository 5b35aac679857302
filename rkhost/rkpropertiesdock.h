#pragma once

#include <QDockWidget>

#include <memory>

class RkMainWindow;
class RkNode;

// The host's own "Properties" dock: the primary selection's properties in the node's groups, each
// edited by the widget class its property names. Rebuilt, once per burst of changes, when the
// primary selection or its property tree changes, and once after a load.
class RkPropertiesDock : public QDockWidget
{
    Q_OBJECT
public:
    explicit RkPropertiesDock(QWidget* parent = nullptr);
    ~RkPropertiesDock() override;

    // The node whose properties are shown, or null.
    RkNode* shownNode() const;

private:
    void scheduleRebuild();
    void rebuild();

    struct Private;
    std::unique_ptr<Private> d;
};

// Adds the dock below the scene list on the left of the main window.
RkPropertiesDock* rkAddPropertiesDock(RkMainWindow* window);
