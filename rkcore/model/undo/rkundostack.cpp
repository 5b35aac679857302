#include "undo/rkundostack.h"

#include "properties/rkproperty.h"

#include <QHash>
#include <QPointer>
#include <QVector>

RkUndoStack* rkUndoStack = nullptr;

namespace
{

struct Change {
    QPointer<RkProperty> property;
    QVariant before;
    QVariant after;
};

struct Entry {
    QString caption;
    QVector<Change> changes;
};

// One change per property: the value before the first change and after the last. Properties
// that came back to where they started drop out.
QVector<Change> compress(const QVector<Change>& changes)
{
    QVector<Change> out;
    QHash<const RkProperty*, int> seen; // a hold on a big rig may touch thousands
    for (const Change& c : changes) {
        if (!c.property)
            continue;
        const auto it = seen.constFind(c.property.data());
        if (it == seen.constEnd()) {
            seen.insert(c.property.data(), out.size());
            out.append(c);
        } else {
            out[*it].after = c.after;
        }
    }
    out.erase(
        std::remove_if(out.begin(), out.end(), [](const Change& c) { return c.before == c.after; }),
        out.end());
    return out;
}

} // namespace

struct RkUndoStack::Private {
    QVector<Entry> entries;
    int index = 0; // entries below index are done, the rest can be redone
    QVector<Change> pending;
    // The open holds, outermost first: their id and pending.size() when they were opened.
    QVector<QPair<int, int>> marks;
    int nextId = 1;
    QString innerCaption;
    bool applying = false;

    void apply(const QVector<Change>& changes, bool backwards)
    {
        applying = true;
        if (backwards) {
            for (int i = changes.size() - 1; i >= 0; --i) {
                if (changes.at(i).property)
                    changes.at(i).property->setValueVariant(changes.at(i).before);
            }
        } else {
            for (const Change& c : changes) {
                if (c.property)
                    c.property->setValueVariant(c.after);
            }
        }
        applying = false;
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
    return d->index < d->entries.size();
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
    return d->entries.size();
}

int RkUndoStack::index() const
{
    return d->index;
}

void RkUndoStack::recordPropertyChange(RkProperty* property, const QVariant& oldValue,
                                       const QVariant& newValue)
{
    if (d->applying || d->marks.isEmpty() || !property)
        return;
    d->pending.append(Change{property, oldValue, newValue});
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
    const QVector<Change> changes = compress(d->pending);
    d->pending.clear();
    if (changes.isEmpty())
        return;
    const QString oldUndo = getUndoCaption(), oldRedo = getRedoCaption();
    const bool oldCanUndo = canUndo(), oldCanRedo = canRedo();
    d->entries.resize(d->index);
    d->entries.append(Entry{caption.isEmpty() ? d->innerCaption : caption, changes});
    d->index = d->entries.size();
    notifyCaptions(oldUndo, oldRedo, oldCanUndo, oldCanRedo);
    // The new entry is on top even when its caption equals the one before.
    if (oldUndo == getUndoCaption())
        Q_EMIT undoCaptionChanged(getUndoCaption());
}

void RkUndoStack::cancelHold(int id)
{
    const int level = holdLevel(id);
    if (level < 0)
        return;
    const int mark = d->marks.at(level).second;
    d->marks.resize(level);
    // Each property goes back once, straight to where it was when the hold opened.
    const QVector<Change> undone = compress(d->pending.mid(mark));
    d->pending.resize(mark);
    d->apply(undone, true);
}

void RkUndoStack::undo()
{
    if (canPushItems() || !canUndo())
        return;
    const QString oldUndo = getUndoCaption(), oldRedo = getRedoCaption();
    const bool oldCanUndo = canUndo(), oldCanRedo = canRedo();
    d->index--;
    d->apply(d->entries.at(d->index).changes, true);
    notifyCaptions(oldUndo, oldRedo, oldCanUndo, oldCanRedo);
}

void RkUndoStack::redo()
{
    if (canPushItems() || !canRedo())
        return;
    const QString oldUndo = getUndoCaption(), oldRedo = getRedoCaption();
    const bool oldCanUndo = canUndo(), oldCanRedo = canRedo();
    d->apply(d->entries.at(d->index).changes, false);
    d->index++;
    notifyCaptions(oldUndo, oldRedo, oldCanUndo, oldCanRedo);
}

void RkUndoStack::clear()
{
    if (d->entries.isEmpty())
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
