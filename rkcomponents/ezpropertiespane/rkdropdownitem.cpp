#include "rkdropdownitem.h"

#include "rkdropdownview.h"

#include <QComboBox>

RkDropDownItem::RkDropDownItem(RkDropDownView* view, int level, QModelIndex parentIndex)
    : view(view), level(level), combo(new QComboBox(view)), parentIndex(parentIndex)
{
}

RkDropDownItem::~RkDropDownItem()
{
    if (combo)
        combo->deleteLater();
}

void RkDropDownItem::currentIndexChanged(int index)
{
    view->madeChoice(level, index);
}
