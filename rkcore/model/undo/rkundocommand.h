#pragma once

#include "rkcoreglobal.h"

#include <QString>

// One undoable change. A command records a change that has already been made: the stack calls
// redo() only when its entry is redone, and undo() when it is undone or its hold is cancelled.
class RKCORE_EXPORT RkUndoCommand
{
public:
    explicit RkUndoCommand(const QString& caption = QString());
    virtual ~RkUndoCommand();
    RkUndoCommand(const RkUndoCommand&) = delete;
    RkUndoCommand& operator=(const RkUndoCommand&) = delete;

    virtual void undo() = 0;
    virtual void redo() = 0;

    // Names the entry when the command is pushed with no hold open.
    QString caption() const;
    void setCaption(const QString& caption);

    // Folding a gesture: a command takes in the later commands of its own class with the same
    // non-null key through mergeWith(), keeping its state before and their state after. Folding
    // stops at a command with a null key and at one of another class with the same key; commands
    // with different keys must not depend on each other's order.
    virtual const void* mergeKey() const;
    virtual void mergeWith(const RkUndoCommand& later);
    // True when undoing would change nothing (a value that came back to where it started);
    // the stack drops such commands.
    virtual bool isNoChange() const;

private:
    QString m_caption;
};
