#pragma once

#include "rkfavoritespropaction.h"

// Add Selected Properties to Figure Favorites.
class RkGlobalFavoritesAddAction : public RkFavoritesPropAction
{
    Q_OBJECT
public:
    RkGlobalFavoritesAddAction();
    ~RkGlobalFavoritesAddAction() override;

protected:
    void apply(RkPropertyPaneList* list) override;
};
