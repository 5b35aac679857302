#pragma once

#include "panes/rkpane.h"

class RkEzPropertiesWgt;

// The Shape tab: the selected figure's morphs by category as thumbnail pages or slider lists,
// and its custom mixers.
class RkEzPropertiesPane : public RkPane
{
    Q_OBJECT
public:
    RkEzPropertiesPane();
    ~RkEzPropertiesPane() override;

    RkEzPropertiesWgt* getPropertiesWgt() const;

private:
    RkEzPropertiesWgt* m_wgt = nullptr;
};
