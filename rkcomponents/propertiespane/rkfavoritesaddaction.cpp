#include "rkfavoritesaddaction.h"

#include "rkpropertiespane.h"
#include "rkpropertypanelist.h"

namespace
{

QPointer<RkPropertiesPane> s_pane;

} // namespace

RkFavoritesAddAction::RkFavoritesAddAction()
    : RkFavoritesPropAction(tr("Add Selected Properties to Local Favorites"),
                            tr("Add selected properties to the Favorites Group."), s_pane)
{
}

RkFavoritesAddAction::~RkFavoritesAddAction() = default;

void RkFavoritesAddAction::apply(RkPropertyPaneList* list)
{
    list->setSelectedFavorite(true);
}
