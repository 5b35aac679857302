#include "rktoolactionmenu.h"

#include "rktoolpane.h"

#include <QKeySequence>
#include <QMenu>

RkToolActionMenu::RkToolActionMenu(RkToolPane* pane, const RkActionMenu* toolMenu)
    : RkActionMenu(toolMenu ? *toolMenu : RkActionMenu()), m_pane(pane)
{
}

RkToolActionMenu::~RkToolActionMenu() = default;

void RkToolActionMenu::buildMenu(QMenu* menu)
{
    if (!menu)
        return;
    RkActionMenu::buildMenu(menu);
    if (!menu->actions().isEmpty())
        menu->addSeparator();
    QAction* close = menu->addAction(RkActionMenu::tr("Close"));
    close->setShortcut(QKeySequence());
    if (m_pane)
        QObject::connect(close, &QAction::triggered, m_pane.data(), &RkPane::hidePane);
}
