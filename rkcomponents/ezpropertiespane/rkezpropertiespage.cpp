#include "rkezpropertiespage.h"

#include "properties/rkproperty.h"
#include "rkezicongridwgt.h"
#include "rkezpageheaderwgt.h"
#include "rkezpropertieswgt.h"
#include "rkezpropertylistwgt.h"
#include "scene/rkscene.h"

#include <QStackedLayout>
#include <QStyleOptionTabWidgetFrame>
#include <QStylePainter>
#include <QVBoxLayout>

namespace
{
constexpr int kTilesPerPage = 8;
} // namespace

RkEzPropertiesPage::RkEzPropertiesPage(RkEzPropertiesWgt* owner) : QFrame(owner), m_owner(owner)
{
    setObjectName(QStringLiteral("ShapePropertiesPage"));
    m_header = new RkEzPageHeaderWgt(this);
    m_iconGrid = new RkEzIconGridWgt(this, this);
    m_list = new RkEzPropertyListWgt(this, this);

    auto* layout = new QVBoxLayout(this);
    m_stack = new QStackedLayout;
    layout->addWidget(m_header, 0);
    layout->addLayout(m_stack, 0);
    m_stack->addWidget(m_iconGrid);
    m_stack->addWidget(m_list);

    if (owner) {
        connect(m_header, &RkEzPageHeaderWgt::modeButtonClicked, owner,
                &RkEzPropertiesWgt::setMode);
        setMode(owner->getMode());
    } else {
        setMode(0);
    }
}

RkEzPropertiesPage::~RkEzPropertiesPage() = default;

RkEzPropertiesWgt* RkEzPropertiesPage::getOwner() const
{
    return m_owner;
}

RkEzPageHeaderWgt* RkEzPropertiesPage::getHeader() const
{
    return m_header;
}

RkEzIconGridWgt* RkEzPropertiesPage::getIconGrid() const
{
    return m_iconGrid;
}

RkEzPropertyListWgt* RkEzPropertiesPage::getList() const
{
    return m_list;
}

QVector<RkProperty*> RkEzPropertiesPage::getProperties() const
{
    QVector<RkProperty*> live;
    live.reserve(m_properties.size());
    for (const auto& property : m_properties) {
        if (property)
            live.append(property);
    }
    return live;
}

int RkEzPropertiesPage::getFirst() const
{
    return m_first;
}

void RkEzPropertiesPage::setProperties(const QVector<RkProperty*>& properties)
{
    m_properties.clear();
    m_properties.reserve(properties.size());
    for (RkProperty* property : properties)
        m_properties.append(property);
    m_header->setNumPages((int(properties.size()) - 1) / kTilesPerPage + 1);
    m_header->setCurrentPage(1);
    gotoProperties(1);
}

void RkEzPropertiesPage::setMode(int mode)
{
    m_header->setMode(mode);
    m_stack->setCurrentIndex(mode);
}

void RkEzPropertiesPage::gotoProperties(int index)
{
    m_first = index * kTilesPerPage - kTilesPerPage;
    const QVector<RkProperty*> properties = getProperties();
    if (!properties.isEmpty()) {
        const int n = properties.size();
        const int last = m_first + kTilesPerPage < n ? m_first + kTilesPerPage : n;
        m_header->setPagingText(QString("%0-%1 of %2").arg(m_first + 1).arg(last).arg(n));
        m_header->setTotalText(QString("%1 sliders in this tab").arg(n));
        m_header->showPager(true);
    } else {
        QString hint;
        if (rkScene->getPrimarySelection())
            hint = QStringLiteral("Navigate above.");
        else if (rkScene->getNumNodes() != 0)
            hint = QStringLiteral("Select something.");
        else
            hint = QStringLiteral("Add some content.");
        m_header->setPagingText(hint);
        m_header->setTotalText(hint);
        m_header->showPager(false);
    }
    m_iconGrid->clear();
    m_list->clear();
    m_iconGrid->addProperties(properties);
    m_list->addProperties(properties);
    if (!isHidden())
        m_iconGrid->scheduleMakeImages();
}

void RkEzPropertiesPage::updateIconImages()
{
    m_iconGrid->scheduleMakeImages();
}

void RkEzPropertiesPage::paintEvent(QPaintEvent*)
{
    // Only the body of a tab widget, under the pane's row of page tabs.
    QStylePainter painter(this);
    QStyleOptionTabWidgetFrame option;
    option.rect = rect();
    painter.drawPrimitive(QStyle::PE_FrameTabWidget, option);
}
