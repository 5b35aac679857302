#include "rkglobalfavoritesremoveaction.h"

#include "rkpropertiespane.h"
#include "rkpropertypanelist.h"

namespace
{

QPointer<RkPropertiesPane> s_pane;

} // namespace

RkGlobalFavoritesRemoveAction::RkGlobalFavoritesRemoveAction()
    : RkFavoritesPropAction(tr("Remove Selected Properties from Figure Favorites"),
                            tr("Remove selected properties from the Figure Favorites Group."),
                            s_pane)
{
}

RkGlobalFavoritesRemoveAction::~RkGlobalFavoritesRemoveAction() = default;

void RkGlobalFavoritesRemoveAction::apply(RkPropertyPaneList* list)
{
    list->setSelectedGlobalFavorite(false);
}
