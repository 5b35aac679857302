#pragma once

#include "panes/rkpane.h"

#include <memory>

class QLabel;
class QStackedWidget;

// The Tool tab: the active viewport tool's name, its options widget and, in the pane's options
// menu, its options menu followed by Close. Follows the viewport manager's active tool.
class RkToolPane : public RkPane
{
    Q_OBJECT
public:
    RkToolPane();
    ~RkToolPane() override;

public Q_SLOTS:
    // Rebuilds after a tool switch; does nothing when nothing has switched since the last call.
    void refresh() override;

private Q_SLOTS:
    void toolSwitched();
    void rebuildMenu();

private:
    struct Private;
    std::unique_ptr<Private> d;
};
