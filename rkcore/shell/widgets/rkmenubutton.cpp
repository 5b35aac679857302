#include "widgets/rkmenubutton.h"

#include <QActionGroup>
#include <QKeyEvent>
#include <QMenu>
#include <QMouseEvent>

#include <algorithm>

namespace
{

struct Item {
    QString text;
    int id = 0;
};

} // namespace

struct RkMenuButton::Private {
    QString caption;
    QList<Item> items;
    int current = -1;
    QMenu* menu = nullptr;           // child of the button, filled afresh each time it pops up
    QActionGroup* choices = nullptr; // child of the menu; shows the items as radio items
};

RkMenuButton::RkMenuButton(QWidget* parent, const QString& name, const QString& text)
    : RkStyledButton(parent, name, text), d(std::make_unique<Private>())
{
    d->caption = text;
    d->menu = new QMenu(this);
    d->choices = new QActionGroup(d->menu);
    setMenuArrowShown(true);
    connect(d->menu, &QMenu::triggered, this,
            [this](QAction* action) { selectItemAt(action->data().toInt()); });
    connect(d->menu, &QMenu::aboutToHide, this, [this] { setDown(false); });
}

RkMenuButton::~RkMenuButton() = default;

int RkMenuButton::insertItem(const QString& text, int id, int index)
{
    if (id < 0) {
        id = 0;
        for (const Item& item : qAsConst(d->items))
            id = std::max(id, item.id + 1);
    }
    if (index < 0 || index > d->items.size())
        index = d->items.size();
    d->items.insert(index, Item{text, id});
    if (d->current >= index)
        ++d->current;
    updateGeometry();
    return id;
}

int RkMenuButton::count() const
{
    return d->items.size();
}

QString RkMenuButton::itemText(int index) const
{
    return index >= 0 && index < d->items.size() ? d->items.at(index).text : QString();
}

int RkMenuButton::itemId(int index) const
{
    return index >= 0 && index < d->items.size() ? d->items.at(index).id : -1;
}

int RkMenuButton::currentIndex() const
{
    return d->current;
}

void RkMenuButton::selectItemAt(int index)
{
    if (index < 0 || index >= d->items.size())
        return;
    d->current = index;
    setText(d->items.at(index).text);
    Q_EMIT menuIndexSelected(index);
}

// Wide enough for the caption and every item, so the button keeps its size as the choice changes.
QSize RkMenuButton::sizeHint() const
{
    QSize size = sizeHintForText(d->caption);
    for (const Item& item : qAsConst(d->items))
        size = size.expandedTo(sizeHintForText(item.text));
    return size;
}

void RkMenuButton::showMenu()
{
    if (d->items.isEmpty() || d->menu->isVisible())
        return;
    d->menu->clear();
    for (int i = 0; i < d->items.size(); ++i) {
        QAction* action = d->menu->addAction(d->items.at(i).text);
        action->setData(i);
        action->setCheckable(true);
        action->setActionGroup(d->choices);
        action->setChecked(i == d->current);
    }
    d->menu->setMinimumWidth(width());
    setDown(true);
    d->menu->popup(mapToGlobal(QPoint(0, height())));
    if (d->current >= 0)
        d->menu->setActiveAction(d->menu->actions().at(d->current));
}

void RkMenuButton::mousePressEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton) {
        RkStyledButton::mousePressEvent(event);
        return;
    }
    event->accept();
    showMenu();
}

void RkMenuButton::keyPressEvent(QKeyEvent* event)
{
    switch (event->key()) {
    case Qt::Key_Space:
    case Qt::Key_Return:
    case Qt::Key_Enter:
    case Qt::Key_F4:
        event->accept();
        showMenu();
        return;
    default:
        RkStyledButton::keyPressEvent(event);
    }
}
