#pragma once

#include "rkfavoritespropaction.h"

// Remove Selected Properties from Figure Favorites.
class RkGlobalFavoritesRemoveAction : public RkFavoritesPropAction
{
    Q_OBJECT
public:
    RkGlobalFavoritesRemoveAction();
    ~RkGlobalFavoritesRemoveAction() override;

protected:
    void apply(RkPropertyPaneList* list) override;
};
