#include "actions/rkactionmenu.h"

#include "actions/rkaction.h"
#include "actions/rkactionmgr.h"

#include <QMenu>

struct RkActionMenu::Entry {
    EntryType type = Action;
    QString text;
    std::unique_ptr<RkActionMenu> subMenu;

    Entry() = default;
    Entry(EntryType t, const QString& s, RkActionMenu* m) : type(t), text(s), subMenu(m) {}
    Entry(const Entry& other)
        : type(other.type), text(other.text),
          subMenu(other.subMenu ? new RkActionMenu(*other.subMenu) : nullptr)
    {
    }
    Entry(Entry&&) = default;
    Entry& operator=(Entry&&) = default;
};

namespace
{
template <typename Vector> typename Vector::iterator insertPosition(Vector& entries, int index)
{
    if (index < 0 || index > int(entries.size()))
        return entries.end();
    return entries.begin() + index;
}
} // namespace

RkActionMenu::RkActionMenu() = default;

RkActionMenu::RkActionMenu(const RkActionMenu& other) : m_entries(other.m_entries) {}

RkActionMenu& RkActionMenu::operator=(const RkActionMenu& other)
{
    if (this != &other) {
        std::vector<Entry> copy(other.m_entries);
        m_entries = std::move(copy);
    }
    return *this;
}

RkActionMenu::~RkActionMenu() = default;

void RkActionMenu::insertAction(const QString& className, int index)
{
    m_entries.insert(insertPosition(m_entries, index), Entry(Action, className, nullptr));
}

void RkActionMenu::insertSeparator(int index)
{
    m_entries.insert(insertPosition(m_entries, index), Entry(Separator, QString(), nullptr));
}

void RkActionMenu::insertMenu(const QString& title, RkActionMenu* subMenu, int index)
{
    if (!subMenu)
        subMenu = new RkActionMenu;
    m_entries.insert(insertPosition(m_entries, index), Entry(SubMenu, title, subMenu));
}

void RkActionMenu::removeEntry(int index)
{
    if (index >= 0 && index < count())
        m_entries.erase(m_entries.begin() + index);
}

void RkActionMenu::clear()
{
    m_entries.clear();
}

int RkActionMenu::count() const
{
    return int(m_entries.size());
}

RkActionMenu::EntryType RkActionMenu::entryType(int index) const
{
    return index >= 0 && index < count() ? m_entries[index].type : Separator;
}

QString RkActionMenu::entryText(int index) const
{
    return index >= 0 && index < count() ? m_entries[index].text : QString();
}

const RkActionMenu* RkActionMenu::subMenu(int index) const
{
    return index >= 0 && index < count() ? m_entries[index].subMenu.get() : nullptr;
}

void RkActionMenu::buildMenu(QMenu* menu)
{
    if (!menu)
        return;
    RkActionMgr* actionMgr = RkActionMgr::current();
    bool separatorPending = false;
    auto flushSeparator = [&] {
        if (separatorPending && !menu->actions().isEmpty() &&
            !menu->actions().constLast()->isSeparator())
            menu->addSeparator();
        separatorPending = false;
    };
    for (const Entry& entry : m_entries) {
        switch (entry.type) {
        case Separator:
            separatorPending = true;
            break;
        case Action: {
            RkAction* action = actionMgr ? actionMgr->findAction(entry.text) : nullptr;
            if (!action)
                break;
            flushSeparator();
            menu->addAction(action);
            break;
        }
        case SubMenu: {
            flushSeparator();
            QMenu* sub = menu->addMenu(entry.text);
            entry.subMenu->buildMenu(sub);
            break;
        }
        }
    }
}
