#pragma once

#include "actions/rkactionmenu.h"

#include <QPointer>

class RkToolPane;

// The Tool pane's options menu: a copy of the active tool's options menu, then a Close entry that
// closes the pane.
class RkToolActionMenu : public RkActionMenu
{
public:
    // Copies the tool's menu when there is one; starts empty otherwise.
    RkToolActionMenu(RkToolPane* pane, const RkActionMenu* toolMenu);
    ~RkToolActionMenu() override;

    void buildMenu(QMenu* menu) override;

private:
    QPointer<RkToolPane> m_pane;
};
