#include "widgets/rkwidgetlistlayout.h"

#include <QWidget>

RkWidgetListLayout::RkWidgetListLayout(QWidget* parent)
    : QBoxLayout(QBoxLayout::TopToBottom, parent)
{
}

RkWidgetListLayout::~RkWidgetListLayout() = default;

void RkWidgetListLayout::beginRefill()
{
    m_refilling = true;
}

void RkWidgetListLayout::endRefill()
{
    m_refilling = false;
    if (m_hidden) {
        m_hidden = false;
        if (QWidget* widget = parentWidget())
            widget->show();
    }
}

bool RkWidgetListLayout::isRefilling() const
{
    return m_refilling;
}

void RkWidgetListLayout::aboutToShow()
{
    QWidget* widget = parentWidget();
    if (m_refilling && !m_hidden && widget && widget->isVisible()) {
        m_hidden = true;
        widget->hide();
    }
}
