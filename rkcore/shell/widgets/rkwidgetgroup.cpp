#include "widgets/rkwidgetgroup.h"

#include "widgets/rkwidgetlistlayout.h"

#include <QMouseEvent>
#include <QPainter>
#include <QPainterPath>
#include <QPointer>
#include <QStyle>
#include <QVBoxLayout>

#include <algorithm>

namespace
{

// Row height of the host style (a custom metric); other styles give 0 and the font decides.
constexpr int rowHeightMetric = 10;

bool listed(const QList<QPointer<QWidget>>& widgets, const QWidget* widget)
{
    return std::any_of(widgets.cbegin(), widgets.cend(),
                       [widget](const QPointer<QWidget>& listed) { return listed == widget; });
}

int spacingUnit(const QWidget* widget)
{
    const int m = widget->style()->pixelMetric(QStyle::PM_CustomBase);
    return m > 0 ? m : 4;
}

// The strip at the top of a group. It draws from the group's state and asks the group to fold.
class GroupHeader : public QWidget
{
public:
    GroupHeader(RkWidgetGroup* group, int depth) : QWidget(group), m_group(group), m_depth(depth)
    {
        setAttribute(Qt::WA_Hover);
        setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Fixed);
    }

    QSize sizeHint() const override
    {
        const QFontMetrics metrics(boldFont());
        const int row =
            style()->pixelMetric(QStyle::PixelMetric(QStyle::PM_CustomBase + rowHeightMetric));
        return QSize(textLeft() + metrics.horizontalAdvance(m_group->text()) + spacingUnit(this),
                     std::max(row, metrics.height() + 6));
    }

    QSize minimumSizeHint() const override { return QSize(textLeft(), sizeHint().height()); }

protected:
    void paintEvent(QPaintEvent*) override
    {
        QPainter p(this);
        // Top-level headers are the darkest; nested ones come closer to the body's colour.
        QColor shade = palette().color(QPalette::Window).darker(std::max(106, 120 - 5 * m_depth));
        if (underMouse())
            shade = shade.lighter(106);
        p.fillRect(rect(), shade);
        p.setPen(palette().color(QPalette::Mid));
        p.drawLine(rect().bottomLeft(), rect().bottomRight());

        const QColor ink = palette().color(QPalette::WindowText);
        const qreal s = triangleSize();
        const QPointF c(spacingUnit(this) + s, height() / 2.0);
        QPainterPath triangle;
        if (m_group->isCollapsed()) {
            triangle.moveTo(c.x() - s * 0.5, c.y() - s);
            triangle.lineTo(c.x() + s * 0.7, c.y());
            triangle.lineTo(c.x() - s * 0.5, c.y() + s);
        } else {
            triangle.moveTo(c.x() - s, c.y() - s * 0.5);
            triangle.lineTo(c.x() + s, c.y() - s * 0.5);
            triangle.lineTo(c.x(), c.y() + s * 0.7);
        }
        triangle.closeSubpath();
        p.setRenderHint(QPainter::Antialiasing);
        p.fillPath(triangle, ink);

        const QFont font = boldFont();
        p.setFont(font);
        p.setPen(ink);
        const QRect textRect = rect().adjusted(textLeft(), 0, -spacingUnit(this), 0);
        p.drawText(
            textRect, Qt::AlignLeft | Qt::AlignVCenter,
            QFontMetrics(font).elidedText(m_group->text(), Qt::ElideRight, textRect.width()));
    }

    // A press and a release on the header make one click, as on a button.
    void mousePressEvent(QMouseEvent* event) override
    {
        m_pressed = event->button() == Qt::LeftButton;
        event->accept();
    }

    void mouseReleaseEvent(QMouseEvent* event) override
    {
        const bool click =
            m_pressed && event->button() == Qt::LeftButton && rect().contains(event->pos());
        m_pressed = false;
        event->accept();
        if (click)
            m_group->setCollapsed(!m_group->isCollapsed());
    }

private:
    QFont boldFont() const
    {
        QFont bold = font();
        bold.setBold(true);
        return bold;
    }
    qreal triangleSize() const { return std::max(3.0, fontMetrics().height() * 0.25); }
    int textLeft() const { return 2 * spacingUnit(this) + int(2 * triangleSize()) + 2; }

    RkWidgetGroup* m_group;
    int m_depth;
    bool m_pressed = false;
};

} // namespace

struct RkWidgetGroup::Private {
    // Removed widgets go back to this layout's widget.
    QPointer<RkWidgetListLayout> listLayout;
    QString text;
    int depth = 0;
    bool collapsed = false;
    bool active = true;
    GroupHeader* header = nullptr;
    QWidget* body = nullptr;
    // The body's one layout: the sub-groups first, then the widgets.
    QVBoxLayout* bodyLayout = nullptr;
    RkWidgetGroup* parentGroup = nullptr;
    // Sub-groups are children of the body and live as long as the group.
    QList<RkWidgetGroup*> groups;
    // Widgets belong to whoever added them; one that left the body no longer counts.
    QList<QPointer<QWidget>> widgets;
    // Widgets that release() left in place for the next fill; settle() hides those not taken back.
    QList<QPointer<QWidget>> stale;
    // Deactivated by release() and still shown until settle().
    bool released = false;
};

RkWidgetGroup::RkWidgetGroup(RkWidgetListLayout* layout, const QString& text, const QString& name,
                             int depth)
    : QWidget(layout ? layout->parentWidget() : nullptr), d(std::make_unique<Private>())
{
    setObjectName(name);
    d->listLayout = layout;
    build(text, depth);
    if (layout)
        layout->addWidget(this);
    if (parentWidget()) {
        aboutToShow();
        show();
    }
}

RkWidgetGroup::RkWidgetGroup(RkWidgetGroup* parentGroup, const QString& text)
    : QWidget(parentGroup->d->body), d(std::make_unique<Private>())
{
    setObjectName(parentGroup->objectName());
    d->listLayout = parentGroup->d->listLayout;
    d->parentGroup = parentGroup;
    build(text, parentGroup->d->depth + 1);
    setContentsMargins(2 * spacingUnit(this), 0, 0, 0);
    aboutToShow();
    show();
}

void RkWidgetGroup::aboutToShow()
{
    if (d->listLayout)
        d->listLayout->aboutToShow();
}

RkWidgetGroup::~RkWidgetGroup() = default;

void RkWidgetGroup::build(const QString& text, int depth)
{
    d->text = text;
    d->depth = depth;
    setAutoFillBackground(true);
    setBackgroundRole(QPalette::Window);
    setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Fixed);

    const int m = spacingUnit(this);
    d->header = new GroupHeader(this, depth);
    d->body = new QWidget(this);
    auto* outer = new QVBoxLayout(this);
    outer->setContentsMargins(0, 0, 0, 0);
    outer->setSpacing(0);
    outer->addWidget(d->header);
    outer->addWidget(d->body);
    // A child never shown counts as empty in a layout: shown now, the body is counted from the
    // first layout pass of a window that is shown later.
    d->header->show();
    d->body->show();

    // Widgets sit a little in from the edge; sub-groups further (their own margin).
    d->bodyLayout = new QVBoxLayout(d->body);
    d->bodyLayout->setContentsMargins(m, 0, 0, m / 2);
    d->bodyLayout->setSpacing(1);
}

QString RkWidgetGroup::text() const
{
    return d->text;
}

void RkWidgetGroup::setText(const QString& text)
{
    if (d->text == text)
        return;
    d->text = text;
    d->header->updateGeometry();
    d->header->update();
}

bool RkWidgetGroup::isCollapsed() const
{
    return d->collapsed;
}

void RkWidgetGroup::setCollapsed(bool collapsed)
{
    if (d->collapsed == collapsed)
        return;
    d->collapsed = collapsed;
    if (!collapsed)
        aboutToShow();
    d->body->setVisible(!collapsed);
    if (!collapsed) {
        for (RkWidgetGroup* group : qAsConst(d->groups)) {
            if (group->d->active)
                group->show();
        }
    }
    d->header->update();
    relayout();
    Q_EMIT collapsedChanged(collapsed);
}

bool RkWidgetGroup::isActive() const
{
    return d->active;
}

void RkWidgetGroup::setActive(bool active)
{
    d->active = active;
    d->released = false;
    if (active && isHidden())
        aboutToShow();
    setVisible(active);
    if (d->parentGroup)
        d->parentGroup->relayout();
}

RkWidgetGroup* RkWidgetGroup::getGroup(const QString& path, bool create)
{
    RkWidgetGroup* group = this;
    const QStringList parts = path.split(QLatin1Char('/'), Qt::SkipEmptyParts);
    for (const QString& part : parts) {
        RkWidgetGroup* match = nullptr;
        RkWidgetGroup* unused = nullptr;
        for (RkWidgetGroup* sub : qAsConst(group->d->groups)) {
            if (sub->d->active && sub->d->text == part) {
                match = sub;
                break;
            }
            if (!sub->d->active && !unused)
                unused = sub;
        }
        if (!match) {
            if (!create)
                return nullptr;
            if (unused) {
                unused->makeFresh(part);
                group->moveWidgetListGroupToEnd(unused);
                match = unused;
            } else {
                match = new RkWidgetGroup(group, part);
                group->d->bodyLayout->insertWidget(group->d->groups.size(), match);
                group->d->groups.append(match);
                group->relayout();
            }
        }
        group = match;
    }
    return group;
}

// A reused group starts as a new one would. Its earlier collapsedChanged receivers belong to what
// it showed before, so the reset emits nothing.
void RkWidgetGroup::makeFresh(const QString& text)
{
    // A released group is empty already; what it showed waits for settle() or a new owner.
    if (!d->released)
        removeAllChildren();
    d->collapsed = false;
    if (d->body->isHidden())
        aboutToShow();
    d->body->show();
    setText(text);
    setActive(true);
}

int RkWidgetGroup::getNumGroups() const
{
    return d->groups.size();
}

RkWidgetGroup* RkWidgetGroup::getGroup(int index) const
{
    return d->groups.value(index, nullptr);
}

bool RkWidgetGroup::hasChildren() const
{
    if (!liveWidgets().isEmpty())
        return true;
    return std::any_of(d->groups.cbegin(), d->groups.cend(),
                       [](const RkWidgetGroup* group) { return group->d->active; });
}

bool RkWidgetGroup::holdsWidget(const QWidget* widget) const
{
    return widget && widget->parentWidget() == d->body && listed(d->widgets, widget);
}

QList<QWidget*> RkWidgetGroup::liveWidgets() const
{
    QList<QWidget*> live;
    for (const QPointer<QWidget>& widget : qAsConst(d->widgets)) {
        if (widget && widget->parentWidget() == d->body)
            live.append(widget);
    }
    return live;
}

void RkWidgetGroup::pruneWidgets()
{
    QWidget* body = d->body;
    d->widgets.erase(std::remove_if(d->widgets.begin(), d->widgets.end(),
                                    [body](const QPointer<QWidget>& widget) {
                                        return !widget || widget->parentWidget() != body;
                                    }),
                     d->widgets.end());
}

void RkWidgetGroup::addWidget(QWidget* widget)
{
    if (!widget)
        return;
    const bool inBody = widget->parentWidget() == d->body;
    if (inBody && listed(d->widgets, widget)) {
        if (widget->isHidden())
            aboutToShow();
        widget->show();
        relayout();
        return;
    }
    if (!inBody)
        pruneWidgets(); // it may have been here before
    else if (!d->stale.isEmpty())
        d->stale.removeOne(widget);
    // Sub-groups come first in the body's layout, then the widgets in order.
    int previous = d->groups.size() - 1;
    while (!d->widgets.isEmpty()) {
        QWidget* last = d->widgets.last();
        const int index =
            last && last->parentWidget() == d->body ? d->bodyLayout->indexOf(last) : -1;
        if (index >= 0) {
            previous = std::max(previous, index);
            break;
        }
        d->widgets.removeLast(); // gone, or no longer in the layout
    }
    int at = -1;
    if (inBody) {
        QLayoutItem* next = d->bodyLayout->itemAt(previous + 1);
        at = next && next->widget() == widget ? previous + 1 : d->bodyLayout->indexOf(widget);
    }
    d->widgets.append(widget);
    // A released widget taken back in its place stays there; released widgets skipped in between
    // are hidden by settle().
    if (at > previous) {
        if (widget->isHidden()) {
            aboutToShow();
            widget->show();
            relayout();
        }
        return;
    }
    if (at >= 0)
        d->bodyLayout->removeWidget(widget);
    d->bodyLayout->addWidget(widget);
    if (widget->isHidden())
        aboutToShow();
    widget->show();
    relayout();
}

void RkWidgetGroup::removeAllChildren()
{
    QWidget* home = d->listLayout ? d->listLayout->parentWidget() : nullptr;
    QList<QWidget*> live = liveWidgets();
    for (const QPointer<QWidget>& widget : qAsConst(d->stale)) {
        if (widget && widget->parentWidget() == d->body && !live.contains(widget))
            live.append(widget);
    }
    d->widgets.clear();
    d->stale.clear();
    for (QWidget* widget : live) {
        d->bodyLayout->removeWidget(widget);
        widget->hide();
        if (home)
            widget->setParent(home);
    }
    for (RkWidgetGroup* group : qAsConst(d->groups)) {
        group->removeAllChildren();
        group->setActive(false);
    }
    relayout();
}

void RkWidgetGroup::resetLayout()
{
    for (RkWidgetGroup* group : qAsConst(d->groups)) {
        if (group->d->active)
            group->resetLayout();
        else
            group->hide();
    }
    relayout();
}

// Layouts of widgets that are not shown yet keep their cached sizes; without this, a list filled
// before it is shown would first lay its groups out at the height of their headers.
void RkWidgetGroup::relayout()
{
    for (RkWidgetGroup* group = this; group; group = group->d->parentGroup) {
        group->d->bodyLayout->invalidate();
        group->d->body->updateGeometry();
        group->updateGeometry();
    }
}

void RkWidgetGroup::release()
{
    for (const QPointer<QWidget>& widget : qAsConst(d->widgets)) {
        if (widget && widget->parentWidget() == d->body)
            d->stale.append(widget);
    }
    d->widgets.clear();
    for (RkWidgetGroup* group : qAsConst(d->groups))
        group->release();
    d->active = false;
    d->released = true;
}

void RkWidgetGroup::settle()
{
    bool changed = false;
    for (const QPointer<QWidget>& widget : qAsConst(d->stale)) {
        if (widget && widget->parentWidget() == d->body && !listed(d->widgets, widget)) {
            d->bodyLayout->removeWidget(widget);
            widget->hide();
            changed = true;
        }
    }
    d->stale.clear();
    for (RkWidgetGroup* group : qAsConst(d->groups))
        group->settle();
    if (d->released) {
        d->released = false;
        hide();
        changed = true;
    }
    if (changed)
        relayout();
}

bool RkWidgetGroup::moveWidgetListGroupToEnd(RkWidgetGroup* group)
{
    const int index = d->groups.indexOf(group);
    if (index >= 0) {
        d->groups.move(index, d->groups.size() - 1);
        d->bodyLayout->removeWidget(group);
        d->bodyLayout->insertWidget(d->groups.size() - 1, group);
        relayout();
        return true;
    }
    return std::any_of(d->groups.cbegin(), d->groups.cend(), [group](RkWidgetGroup* sub) {
        return sub->moveWidgetListGroupToEnd(group);
    });
}

QListIterator<RkWidgetGroup*> RkWidgetGroup::groupListIterator() const
{
    return QListIterator<RkWidgetGroup*>(d->groups);
}

QListIterator<QWidget*> RkWidgetGroup::widgetListIterator() const
{
    return QListIterator<QWidget*>(liveWidgets());
}
