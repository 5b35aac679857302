#include "rkfavoritesremoveaction.h"

#include "rkpropertiespane.h"
#include "rkpropertypanelist.h"

namespace
{

QPointer<RkPropertiesPane> s_pane;

} // namespace

RkFavoritesRemoveAction::RkFavoritesRemoveAction()
    : RkFavoritesPropAction(tr("Remove Selected Properties from Local Favorites"),
                            tr("Remove selected properties from the Favorites Group."), s_pane)
{
}

RkFavoritesRemoveAction::~RkFavoritesRemoveAction() = default;

void RkFavoritesRemoveAction::apply(RkPropertyPaneList* list)
{
    list->setSelectedFavorite(false);
}
