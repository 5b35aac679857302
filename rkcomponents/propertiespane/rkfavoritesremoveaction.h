#pragma once

#include "rkfavoritespropaction.h"

// Remove Selected Properties from Local Favorites.
class RkFavoritesRemoveAction : public RkFavoritesPropAction
{
    Q_OBJECT
public:
    RkFavoritesRemoveAction();
    ~RkFavoritesRemoveAction() override;

protected:
    void apply(RkPropertyPaneList* list) override;
};
