#pragma once

#include "actions/rkaction.h"

#include <QPointer>

class RkPropertiesPane;
class RkPropertyPaneList;

// Base of the four favourites actions of the Parameters tab's right-click menu: each changes a
// favourite flag of the selected properties in both lists and asks the pane for a rebuild.
class RkFavoritesPropAction : public RkAction
{
    Q_OBJECT
public:
    ~RkFavoritesPropAction() override;

    QString getActionGroup() const override;
    void executeAction() override;

protected:
    // paneCache is the subclass's own look-up cache; it outlives the action.
    RkFavoritesPropAction(const QString& text, const QString& description,
                          QPointer<RkPropertiesPane>& paneCache);
    virtual void apply(RkPropertyPaneList* list) = 0;

private:
    QPointer<RkPropertiesPane>& m_paneCache;
};
