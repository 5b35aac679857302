#include "viewport/rkviewtoolbar.h"

#include <QHBoxLayout>
#include <QStyle>

RkViewToolBar::RkViewToolBar(QWidget* parent) : QWidget(parent)
{
    setObjectName(QStringLiteral("ViewToolBar"));
    const int m = style()->pixelMetric(QStyle::PM_CustomBase);
    auto* layout = new QHBoxLayout(this);
    layout->setContentsMargins(m, m, m, m);
    layout->setSpacing(m);
    m_left = new QHBoxLayout;
    m_left->setSpacing(m);
    m_right = new QHBoxLayout;
    m_right->setSpacing(m);
    layout->addLayout(m_left);
    layout->addStretch(1);
    layout->addLayout(m_right);
    setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Fixed);
}

RkViewToolBar::~RkViewToolBar() = default;

void RkViewToolBar::addWidget(QWidget* widget, int side)
{
    if (!widget)
        return;
    (side == Right ? m_right : m_left)->addWidget(widget);
}
