#include "rkdropdownview.h"

#include "rkdropdownitem.h"
#include "rksourcewarning.h"

#include <QComboBox>
#include <QStyle>
#include <QVBoxLayout>

#include <algorithm>

namespace
{

// The host style's combo box height.
const QStyle::PixelMetric kComboHeight = QStyle::PixelMetric(QStyle::PM_CustomBase + 10);

} // namespace

RkDropDownView::RkDropDownView(QWidget* parent) : QAbstractItemView(parent)
{
    setObjectName(QStringLiteral("DropDownView"));
    setFrameStyle(0);
    auto* outer = new QVBoxLayout(this);
    outer->setContentsMargins(0, 0, 0, 0);
    outer->setSpacing(0);
    levelLayout = new QVBoxLayout;
    levelLayout->setContentsMargins(0, 0, 0, 0);
    levelLayout->setSpacing(style()->pixelMetric(QStyle::PM_CustomBase));
    outer->addLayout(levelLayout, 0);
    outer->addStretch(0);
    viewport()->setBackgroundRole(QPalette::Window);
}

RkDropDownView::~RkDropDownView()
{
    for (int k = items.count() - 1; k >= 0; --k)
        delete items[k];
    items.clear();
}

void RkDropDownView::doItemsLayout()
{
    buildLevel(-1, 0, QStringLiteral("Make Selection"));
    QAbstractItemView::doItemsLayout();
}

void RkDropDownView::madeChoice(int itemIndex, int choiceIndex)
{
    if (itemIndex < 0 || itemIndex >= items.count() || !items[itemIndex]->combo) {
        RK_SOURCE_WARNING(
            QStringLiteral("No level %1 in RkDropDownView::madeChoice()").arg(itemIndex));
        return;
    }
    // A combo box that was emptied reports -1: there is no choice to follow.
    if (choiceIndex < 0)
        return;
    const int row = items[itemIndex]->combo->itemData(choiceIndex, Qt::UserRole).toInt();
    buildLevel(itemIndex, row, QStringLiteral("Make Selection"));
}

void RkDropDownView::buildLevel(int itemIndex, int choiceRow, QString placeholder)
{
    // Dropped levels are hidden now, so the layout and the height no longer count them.
    for (int k = items.count() - 1; k > itemIndex; --k) {
        // The box goes in the same pass as its level, not one pass after it.
        if (items[k]->combo) {
            items[k]->combo->hide();
            items[k]->combo->deleteLater();
        }
        items[k]->deleteLater();
    }
    items.resize(std::max(itemIndex + 1, 0));

    if (choiceRow == -1 && itemIndex >= 0) {
        fitHeight();
        updateGeometry();
        Q_EMIT activated(items[itemIndex]->parentIndex);
        return;
    }

    QAbstractItemModel* m = model();
    const QModelIndex parent =
        itemIndex == -1 ? rootIndex() : m->index(choiceRow, 0, items[itemIndex]->parentIndex);
    int rows = 0;
    if (m->hasChildren(parent)) {
        if (m->canFetchMore(parent))
            m->fetchMore(parent);
        rows = m->rowCount(parent);
    }

    auto* item = new RkDropDownItem(this, items.count(), parent);
    QComboBox* combo = item->combo;
    combo->insertItem(0, placeholder, -1);
    for (int r = 0; r < rows; ++r)
        combo->addItem(m->data(m->index(r, 0, parent), Qt::DisplayRole).toString(), r);
    items.append(item);
    levelLayout->addWidget(combo);
    combo->setVisible(rows > 0);

    fitHeight();
    updateGeometry();
    Q_EMIT activated(parent);
    // Connected only now, so filling the box reports nothing.
    connect(combo, QOverload<int>::of(&QComboBox::currentIndexChanged), item,
            &RkDropDownItem::currentIndexChanged);
}

int RkDropDownView::rowHeight() const
{
    return levelLayout->spacing() + style()->pixelMetric(kComboHeight);
}

// One row per visible combo box; an empty view still keeps the height of one.
void RkDropDownView::fitHeight()
{
    int h = 0;
    for (const RkDropDownItem* item : qAsConst(items)) {
        if (item->combo && !item->combo->isHidden())
            h += rowHeight();
    }
    if (h == 0)
        h = rowHeight();
    if (minimumSize().height() != h)
        setFixedHeight(h);
}

QRect RkDropDownView::visualRect(const QModelIndex&) const
{
    return rect();
}

void RkDropDownView::scrollTo(const QModelIndex&, ScrollHint) {}

QModelIndex RkDropDownView::indexAt(const QPoint&) const
{
    return QModelIndex();
}

QModelIndex RkDropDownView::moveCursor(CursorAction, Qt::KeyboardModifiers)
{
    return QModelIndex();
}

int RkDropDownView::horizontalOffset() const
{
    return 0;
}

int RkDropDownView::verticalOffset() const
{
    return 0;
}

bool RkDropDownView::isIndexHidden(const QModelIndex&) const
{
    return false;
}

void RkDropDownView::setSelection(const QRect&, QItemSelectionModel::SelectionFlags) {}

QRegion RkDropDownView::visualRegionForSelection(const QItemSelection&) const
{
    return QRegion(rect());
}

QSize RkDropDownView::minimumSizeHint() const
{
    QSize size = QAbstractScrollArea::minimumSizeHint();
    const int rows =
        3 * (style()->pixelMetric(kComboHeight) + style()->pixelMetric(QStyle::PM_CustomBase));
    size.setHeight(std::max(size.height(), rows));
    return size;
}

QSize RkDropDownView::sizeHint() const
{
    return minimumSizeHint();
}
