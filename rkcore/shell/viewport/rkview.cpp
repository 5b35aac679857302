#include "viewport/rkview.h"

#include "viewport/rkviewtoolbar.h"

RkView::RkView(const QString& name, QWidget* parent)
    : QWidget(parent), m_toolBar(new RkViewToolBar(this))
{
    setObjectName(name);
}

RkView::~RkView() = default;

RkViewToolBar* RkView::getToolBar() const
{
    return m_toolBar;
}

QString RkView::getLabel() const
{
    return objectName();
}

QIcon RkView::getIcon() const
{
    return QIcon();
}

void RkView::buildToolBar() {}
