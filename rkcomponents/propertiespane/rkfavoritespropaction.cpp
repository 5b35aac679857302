#include "rkfavoritespropaction.h"

#include "rkpropertiespane.h"

RkFavoritesPropAction::RkFavoritesPropAction(const QString& text, const QString& description,
                                             QPointer<RkPropertiesPane>& paneCache)
    : RkAction(text, description), m_paneCache(paneCache)
{
}

RkFavoritesPropAction::~RkFavoritesPropAction() = default;

QString RkFavoritesPropAction::getActionGroup() const
{
    return tr("Parameters");
}

void RkFavoritesPropAction::executeAction()
{
    RkPropertiesPane* pane = RkPropertiesPane::find(m_paneCache);
    if (!pane) {
        qWarning("No RkPropertiesPane instance could be found in "
                 "RkFavoritesPropAction::executeAction()");
        return;
    }
    apply(pane->getFavoritesList());
    apply(pane->getPropertiesList());
    pane->updateSelection();
}
