#include "undo/rkundostack.h"

#include <QHash>
#include <QPair>
#include <QVector>

#include <algorithm>
#include <iterator>
#include <typeinfo>

RkUndoStack* rkUndoStack = nullptr;

namespace
{

using Commands = std::vector<std::unique_ptr<RkUndoCommand>>;

struct Entry {
    QString caption;
    Commands commands;
};

// Folds the commands of one gesture: a command takes in the later ones of its class and key, and
// those that end up changing nothing drop out. Folding never reorders what depends on order: it
// stops at a command that never merges, and at a command of another class with the same key.
Commands fold(Commands commands)
{
    Commands out;
    out.reserve(commands.size());
    QHash<const void*, size_t> last; // where each key went; a hold on a big rig records thousands
    for (std::unique_ptr<RkUndoCommand>& c : commands) {
        const RkUndoCommand& command = *c;
        const void* key = command.mergeKey();
        if (!key) {
            if (command.isNoChange())
                continue;
            last.clear();
            out.push_back(std::move(c));
            continue;
        }
        const auto it = last.constFind(key);
        if (it != last.constEnd()) {
            RkUndoCommand& first = *out[*it];
            if (typeid(first) == typeid(command)) {
                first.mergeWith(command);
                continue;
            }
        }
        last.insert(key, out.size());
        out.push_back(std::move(c));
    }
    out.erase(
        std::remove_if(out.begin(), out.end(),
                       [](const std::unique_ptr<RkUndoCommand>& c) { return c->isNoChange(); }),
        out.end());
    return out;
}

} // namespace

struct RkUndoStack::Private {
    std::vector<Entry> entries;
    int index = 0; // entries below index are done, the rest can be redone
    Commands pending;
    // The open holds, outermost first: their id and pending.size() when they were opened.
    QVector<QPair<int, size_t>> marks;
    int nextId = 1;
    QString innerCaption;
    bool applying = false;
    // A clear() asked for by a command while it was applied waits until the entry is done.
    bool clearRequested = false;

    void apply(const Commands& commands, bool backwards)
    {
        applying = true;
        if (backwards) {
            for (auto it = commands.rbegin(); it != commands.rend(); ++it)
                (*it)->undo();
        } else {
            for (const std::unique_ptr<RkUndoCommand>& c : commands)
                c->redo();
        }
        applying = false;
        if (clearRequested) {
            clearRequested = false;
            entries.clear();
            index = 0;
        }
    }
};

RkUndoStack::RkUndoStack(QObject* parent) : QObject(parent), d(std::make_unique<Private>()) {}

RkUndoStack::~RkUndoStack() = default;

bool RkUndoStack::canPushItems() const
{
    return !d->marks.isEmpty();
}

int RkUndoStack::holdDepth() const
{
    return d->marks.size();
}

bool RkUndoStack::canUndo() const
{
    return d->index > 0;
}

bool RkUndoStack::canRedo() const
{
    return d->index < count();
}

QString RkUndoStack::getUndoCaption() const
{
    return canUndo() ? d->entries.at(d->index - 1).caption : QString();
}

QString RkUndoStack::getRedoCaption() const
{
    return canRedo() ? d->entries.at(d->index).caption : QString();
}

int RkUndoStack::count() const
{
    return int(d->entries.size());
}

int RkUndoStack::index() const
{
    return d->index;
}

void RkUndoStack::push(std::unique_ptr<RkUndoCommand> command)
{
    if (d->applying || !command)
        return;
    if (!d->marks.isEmpty()) {
        d->pending.push_back(std::move(command));
        return;
    }
    const QString caption = command->caption();
    Commands commands;
    commands.push_back(std::move(command));
    addEntry(caption, fold(std::move(commands)));
}

int RkUndoStack::openHold()
{
    if (d->marks.isEmpty())
        d->innerCaption.clear();
    const int id = d->nextId++;
    d->marks.append(qMakePair(id, d->pending.size()));
    return id;
}

int RkUndoStack::holdLevel(int id) const
{
    for (int i = 0; i < d->marks.size(); ++i) {
        if (d->marks.at(i).first == id)
            return i;
    }
    return -1;
}

void RkUndoStack::acceptHold(int id, const QString& caption)
{
    // A hold closed together with an outer one has nothing left to do.
    const int level = holdLevel(id);
    if (level < 0)
        return;
    if (level > 0) {
        d->marks.resize(level);
        if (!caption.isEmpty())
            d->innerCaption = caption;
        return;
    }
    d->marks.clear();
    Commands commands = fold(std::move(d->pending));
    d->pending.clear();
    addEntry(caption.isEmpty() ? d->innerCaption : caption, std::move(commands));
}

void RkUndoStack::cancelHold(int id)
{
    const int level = holdLevel(id);
    if (level < 0)
        return;
    const size_t mark = d->marks.at(level).second;
    d->marks.resize(level);
    // Each change is taken back once, straight to where it was when the hold opened.
    Commands undone(std::make_move_iterator(d->pending.begin() + mark),
                    std::make_move_iterator(d->pending.end()));
    d->pending.erase(d->pending.begin() + mark, d->pending.end());
    const QString oldUndo = getUndoCaption(), oldRedo = getRedoCaption();
    const bool oldCanUndo = canUndo(), oldCanRedo = canRedo();
    d->apply(fold(std::move(undone)), true);
    notifyCaptions(oldUndo, oldRedo, oldCanUndo, oldCanRedo);
}

void RkUndoStack::addEntry(const QString& caption, Commands commands)
{
    if (commands.empty())
        return;
    const QString oldUndo = getUndoCaption(), oldRedo = getRedoCaption();
    const bool oldCanUndo = canUndo(), oldCanRedo = canRedo();
    d->entries.erase(d->entries.begin() + d->index, d->entries.end());
    d->entries.push_back(Entry{caption, std::move(commands)});
    d->index = count();
    notifyCaptions(oldUndo, oldRedo, oldCanUndo, oldCanRedo);
    // The new entry is on top even when its caption equals the one before.
    if (oldUndo == getUndoCaption())
        Q_EMIT undoCaptionChanged(getUndoCaption());
}

void RkUndoStack::undo()
{
    if (d->applying || canPushItems() || !canUndo())
        return;
    const QString oldUndo = getUndoCaption(), oldRedo = getRedoCaption();
    const bool oldCanUndo = canUndo(), oldCanRedo = canRedo();
    d->index--;
    d->apply(d->entries.at(d->index).commands, true);
    notifyCaptions(oldUndo, oldRedo, oldCanUndo, oldCanRedo);
}

void RkUndoStack::redo()
{
    if (d->applying || canPushItems() || !canRedo())
        return;
    const QString oldUndo = getUndoCaption(), oldRedo = getRedoCaption();
    const bool oldCanUndo = canUndo(), oldCanRedo = canRedo();
    d->index++;
    d->apply(d->entries.at(d->index - 1).commands, false);
    notifyCaptions(oldUndo, oldRedo, oldCanUndo, oldCanRedo);
}

void RkUndoStack::clear()
{
    if (d->applying) {
        d->clearRequested = true;
        return;
    }
    if (d->entries.empty())
        return;
    const QString oldUndo = getUndoCaption(), oldRedo = getRedoCaption();
    const bool oldCanUndo = canUndo(), oldCanRedo = canRedo();
    d->entries.clear();
    d->index = 0;
    notifyCaptions(oldUndo, oldRedo, oldCanUndo, oldCanRedo);
}

void RkUndoStack::notifyCaptions(const QString& oldUndo, const QString& oldRedo, bool oldCanUndo,
                                 bool oldCanRedo)
{
    if (oldUndo != getUndoCaption() || oldCanUndo != canUndo())
        Q_EMIT undoCaptionChanged(getUndoCaption());
    if (oldRedo != getRedoCaption() || oldCanRedo != canRedo())
        Q_EMIT redoCaptionChanged(getRedoCaption());
    if (oldCanUndo != canUndo())
        Q_EMIT canUndoChanged(canUndo());
    if (oldCanRedo != canRedo())
        Q_EMIT canRedoChanged(canRedo());
}
