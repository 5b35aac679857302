#include "rkezpageheaderwgt.h"

#include "actions/rkhelpmgr.h"
#include "app/rkstyle.h"
#include "rkezpropertiespage.h"

#include <QButtonGroup>
#include <QEvent>
#include <QHBoxLayout>
#include <QLabel>
#include <QPushButton>
#include <QSpinBox>
#include <QStyle>

namespace
{

QPushButton* makeButton(QWidget* parent)
{
    auto* button = new QPushButton(QString(), parent);
    button->setFixedSize(20, 20);
    return button;
}

QIcon customIcon(int offset)
{
    return RkStyle::icon(QStyle::StandardPixmap(QStyle::SP_CustomBase + offset));
}

} // namespace

RkEzPageHeaderWgt::RkEzPageHeaderWgt(RkEzPropertiesPage* page) : QWidget(page), m_page(page)
{
    const int m = style()->pixelMetric(QStyle::PM_CustomBase);
    setObjectName(QStringLiteral("ShapePageHeaderWgt"));

    m_pager = new QWidget(this);
    auto* pagerLayout = new QHBoxLayout(m_pager);
    pagerLayout->setContentsMargins(0, 0, 0, 0);
    pagerLayout->setSpacing(0);
    m_pageSpin = new QSpinBox(m_pager);
    m_pageSpin->setRange(1, 1);
    m_prevButton = makeButton(m_pager);
    m_nextButton = makeButton(m_pager);
    pagerLayout->addWidget(m_prevButton, 0);
    pagerLayout->addWidget(m_pageSpin, 0);
    pagerLayout->addWidget(m_nextButton, 0);
    connect(m_pageSpin, QOverload<int>::of(&QSpinBox::valueChanged), page,
            &RkEzPropertiesPage::gotoProperties);
    connect(m_prevButton, &QPushButton::clicked, m_pageSpin, &QSpinBox::stepDown);
    connect(m_nextButton, &QPushButton::clicked, m_pageSpin, &QSpinBox::stepUp);

    m_pagingLabel = new QLabel(this);
    m_totalLabel = new QLabel(this);
    m_refreshButton = makeButton(this);
    connect(m_refreshButton, &QPushButton::clicked, page, &RkEzPropertiesPage::updateIconImages);

    auto* group = new QButtonGroup(this);
    m_imageViewButton = makeButton(this);
    m_listViewButton = makeButton(this);
    m_imageViewButton->setCheckable(true);
    m_listViewButton->setCheckable(true);
    m_imageViewButton->setChecked(true);
    group->addButton(m_imageViewButton, 0);
    group->addButton(m_listViewButton, 1);
    connect(group, &QButtonGroup::idClicked, this, &RkEzPageHeaderWgt::setModeFromClick);

    auto* layout = new QHBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);
    layout->addWidget(m_pager);
    layout->addSpacing(m);
    layout->addWidget(m_pagingLabel);
    layout->addWidget(m_totalLabel);
    layout->addStretch(1);
    layout->addWidget(m_refreshButton);
    layout->addSpacing(2 * m);
    layout->addWidget(m_imageViewButton);
    layout->addWidget(m_listViewButton);

    setIcons();
    RkHelpMgr::setOnlineHelp(m_refreshButton, QStringLiteral("Refresh"), QStringLiteral("Refresh"),
                             QString(), QString());
    RkHelpMgr::setOnlineHelp(m_imageViewButton, QStringLiteral("Image View"),
                             QStringLiteral("Image View"), QString(), QString());
    RkHelpMgr::setOnlineHelp(m_listViewButton, QStringLiteral("List View"),
                             QStringLiteral("List View"), QString(), QString());
}

RkEzPageHeaderWgt::~RkEzPageHeaderWgt() = default;

QSpinBox* RkEzPageHeaderWgt::getPageSpin() const
{
    return m_pageSpin;
}

QLabel* RkEzPageHeaderWgt::getPagingLabel() const
{
    return m_pagingLabel;
}

QLabel* RkEzPageHeaderWgt::getTotalLabel() const
{
    return m_totalLabel;
}

QWidget* RkEzPageHeaderWgt::getPager() const
{
    return m_pager;
}

QPushButton* RkEzPageHeaderWgt::getPrevButton() const
{
    return m_prevButton;
}

QPushButton* RkEzPageHeaderWgt::getNextButton() const
{
    return m_nextButton;
}

QPushButton* RkEzPageHeaderWgt::getRefreshButton() const
{
    return m_refreshButton;
}

QPushButton* RkEzPageHeaderWgt::getImageViewButton() const
{
    return m_imageViewButton;
}

QPushButton* RkEzPageHeaderWgt::getListViewButton() const
{
    return m_listViewButton;
}

void RkEzPageHeaderWgt::setNumPages(int numPages)
{
    m_pageSpin->setMaximum(numPages);
}

void RkEzPageHeaderWgt::setCurrentPage(int page)
{
    m_pageSpin->setValue(page);
}

void RkEzPageHeaderWgt::setPagingText(QString text)
{
    m_pagingLabel->setText(text);
}

void RkEzPageHeaderWgt::setTotalText(QString text)
{
    m_totalLabel->setText(text);
}

void RkEzPageHeaderWgt::setMode(int mode)
{
    showPager(mode == 0 && !m_page->getProperties().isEmpty());
    m_pagingLabel->setVisible(mode == 0);
    m_totalLabel->setVisible(mode == 1);
    m_imageViewButton->setChecked(mode == 0);
    m_listViewButton->setChecked(mode == 1);
}

void RkEzPageHeaderWgt::showPager(bool onOff)
{
    m_pager->setVisible(onOff);
}

void RkEzPageHeaderWgt::setModeFromClick(int mode)
{
    setMode(mode);
    Q_EMIT modeButtonClicked(mode);
}

void RkEzPageHeaderWgt::changeEvent(QEvent* event)
{
    if (event->type() == QEvent::StyleChange)
        setIcons();
    QWidget::changeEvent(event);
}

void RkEzPageHeaderWgt::setIcons()
{
    m_prevButton->setIcon(customIcon(48));
    m_nextButton->setIcon(customIcon(49));
    m_refreshButton->setIcon(customIcon(124));
    m_imageViewButton->setIcon(customIcon(126));
    m_listViewButton->setIcon(customIcon(125));
}
