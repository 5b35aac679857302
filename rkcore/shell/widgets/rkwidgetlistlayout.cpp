#include "widgets/rkwidgetlistlayout.h"

RkWidgetListLayout::RkWidgetListLayout(QWidget* parent)
    : QBoxLayout(QBoxLayout::TopToBottom, parent)
{
}

RkWidgetListLayout::~RkWidgetListLayout() = default;
