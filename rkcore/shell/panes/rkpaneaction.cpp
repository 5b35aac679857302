#include "panes/rkpaneaction.h"

#include "panes/rkpane.h"
#include "panes/rkpanemgr.h"

RkPaneAction::RkPaneAction(const QString& paneClassName, QObject* parent)
    : RkAction(paneClassName, tr("Show or hide the %1 pane").arg(paneClassName), parent),
      m_paneClassName(paneClassName)
{
    setCheckable(true);
}

RkPaneAction::~RkPaneAction() = default;

QString RkPaneAction::getPaneClassName() const
{
    return m_paneClassName;
}

QString RkPaneAction::getActionGroup() const
{
    return tr("Panes");
}

QString RkPaneAction::getDefaultMenuPath() const
{
    return QStringLiteral("&Window/&Panes");
}

void RkPaneAction::init()
{
    RkPaneMgr* paneMgr = RkPaneMgr::current();
    if (!paneMgr)
        return;
    connect(paneMgr, &RkPaneMgr::paneVisibilityChanged, this, &RkPaneAction::paneVisibilityChanged);
    if (RkPane* pane = paneMgr->findPane(m_paneClassName)) {
        setText(pane->getLabel());
        setDescription(tr("Show or hide the %1 pane").arg(pane->getLabel()));
        setChecked(paneMgr->isPaneVisible(m_paneClassName));
    }
    RkAction::init();
}

void RkPaneAction::toggleAction(bool onOff)
{
    RkPaneMgr* paneMgr = RkPaneMgr::current();
    if (!paneMgr)
        return;
    paneMgr->showPane(m_paneClassName, onOff);
    // The pane may not exist (no factory): the check mark then tells the truth.
    setChecked(paneMgr->isPaneVisible(m_paneClassName));
}

void RkPaneAction::paneVisibilityChanged(const QString& paneClassName, bool visible)
{
    if (paneClassName == m_paneClassName)
        setChecked(visible);
}
