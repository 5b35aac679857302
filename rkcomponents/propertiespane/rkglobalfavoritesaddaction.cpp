#include "rkglobalfavoritesaddaction.h"

#include "rkpropertiespane.h"
#include "rkpropertypanelist.h"

namespace
{

QPointer<RkPropertiesPane> s_pane;

} // namespace

RkGlobalFavoritesAddAction::RkGlobalFavoritesAddAction()
    : RkFavoritesPropAction(tr("Add Selected Properties to Figure Favorites"),
                            tr("Add selected properties to the Figure Favorites Group."), s_pane)
{
}

RkGlobalFavoritesAddAction::~RkGlobalFavoritesAddAction() = default;

void RkGlobalFavoritesAddAction::apply(RkPropertyPaneList* list)
{
    list->setSelectedGlobalFavorite(true);
}
