#include "rkezpropertylistwgt.h"

#include "properties/rkfloatproperty.h"
#include "rkezpropertiesslider.h"

#include <QHeaderView>
#include <QScrollArea>
#include <QSignalBlocker>
#include <QStandardItemModel>
#include <QStyle>
#include <QVBoxLayout>

namespace
{
// The name column's width, shared by every list for the whole run.
int labelWidth = 100;
} // namespace

struct RkEzPropertyListWgt::Private {
    QWidget* owner = nullptr;
    QHeaderView* header = nullptr;
    // Inside the scroll area; rowsLayout holds the rows in order.
    QWidget* content = nullptr;
    QVBoxLayout* rowsLayout = nullptr;
    QList<RkEzPropertiesSlider*> rows;
};

RkEzPropertyListWgt::RkEzPropertyListWgt(QWidget* parent, QWidget* owner)
    : QWidget(parent), d(std::make_unique<Private>())
{
    d->owner = owner;
    setObjectName(QStringLiteral("ShapePropertyListWgt"));
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);

    d->header = new QHeaderView(Qt::Horizontal, this);
    d->header->setFixedHeight(
        style()->pixelMetric(QStyle::PixelMetric(QStyle::PM_CustomBase + 10)));
    auto* model = new QStandardItemModel(0, 2, this);
    model->setHeaderData(0, Qt::Horizontal, tr("Name"), Qt::EditRole);
    model->setHeaderData(1, Qt::Horizontal, tr("Value"), Qt::EditRole);
    d->header->setModel(model);
    d->header->setSectionResizeMode(QHeaderView::Interactive);
    d->header->setSectionResizeMode(1, QHeaderView::Stretch);
    layout->addWidget(d->header, 0);

    connect(d->header, &QHeaderView::sectionResized, this,
            &RkEzPropertyListWgt::listHeadersResized);
    connect(d->header, &QHeaderView::sectionHandleDoubleClicked, this,
            &RkEzPropertyListWgt::headerHandleDoubleClicked);

    // The scroll area owns the content from here on.
    const int m = style()->pixelMetric(QStyle::PM_CustomBase);
    d->content = new QWidget;
    auto* contentLayout = new QVBoxLayout(d->content);
    contentLayout->setContentsMargins(0, 0, 0, 0);
    contentLayout->setSpacing(0);
    d->rowsLayout = new QVBoxLayout;
    d->rowsLayout->setContentsMargins(m, m, m, m);
    d->rowsLayout->setSpacing(m);
    contentLayout->addLayout(d->rowsLayout);
    // Rows stay at the top.
    contentLayout->addStretch(100);

    auto* scroll = new QScrollArea(this);
    scroll->setWidget(d->content);
    scroll->setWidgetResizable(true);
    scroll->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    layout->addWidget(scroll, 100);
}

RkEzPropertyListWgt::~RkEzPropertyListWgt() = default;

QWidget* RkEzPropertyListWgt::getOwner() const
{
    return d->owner;
}

QHeaderView* RkEzPropertyListWgt::getHeader() const
{
    return d->header;
}

QList<RkEzPropertiesSlider*> RkEzPropertyListWgt::getRows() const
{
    return d->rows;
}

void RkEzPropertyListWgt::clear()
{
    for (int i = d->rows.count() - 1; i >= 0; --i)
        d->rows[i]->deleteLater();
    d->rows.clear();
}

void RkEzPropertyListWgt::addProperties(QVector<RkProperty*> properties)
{
    for (RkProperty* property : properties) {
        auto* floatProperty = qobject_cast<RkFloatProperty*>(property);
        if (!floatProperty)
            continue;
        auto* row = new RkEzPropertiesSlider(floatProperty, d->content, d->owner);
        d->rowsLayout->addWidget(row);
        d->rows.append(row);
        row->show();
    }
    syncHeaderAndLabelSize();
}

void RkEzPropertyListWgt::listHeadersResized(int logicalIndex, int, int newSize)
{
    if (logicalIndex != 0)
        return;
    // The Value column keeps at least the minimum section width; a header narrower than that
    // leaves the Name column nothing rather than less than nothing.
    const int limit = qMax(0, d->header->width() - d->header->minimumSectionSize());
    if (d->header->isVisible() && newSize > limit) {
        newSize = limit;
        d->header->resizeSection(0, newSize);
    }
    resizeListLabels(newSize);
    labelWidth = newSize;
}

void RkEzPropertyListWgt::resizeListLabels(int width)
{
    for (RkEzPropertiesSlider* row : qAsConst(d->rows))
        row->setLabelWidth(width);
}

void RkEzPropertyListWgt::syncHeaderAndLabelSize()
{
    const QSignalBlocker blocker(d->header);
    d->header->resizeSection(0, labelWidth);
    listHeadersResized(0, labelWidth, labelWidth);
}

void RkEzPropertyListWgt::headerHandleDoubleClicked(int logicalIndex)
{
    if (logicalIndex == 0)
        autoResizeLabels();
}

void RkEzPropertyListWgt::autoResizeLabels()
{
    int width = 0;
    for (RkEzPropertiesSlider* row : qAsConst(d->rows))
        width = qMax(width, row->labelTextWidth());
    if (width > 0) {
        labelWidth = width;
        syncHeaderAndLabelSize();
    }
}

void RkEzPropertyListWgt::showEvent(QShowEvent* event)
{
    // Another list may have changed the shared width meanwhile.
    syncHeaderAndLabelSize();
    QWidget::showEvent(event);
}
