#pragma once

#include "rkfavoritespropaction.h"

// Add Selected Properties to Local Favorites.
class RkFavoritesAddAction : public RkFavoritesPropAction
{
    Q_OBJECT
public:
    RkFavoritesAddAction();
    ~RkFavoritesAddAction() override;

protected:
    void apply(RkPropertyPaneList* list) override;
};
