#pragma once

#include "rkcoreglobal.h"
#include "undo/rkundocommand.h"

#include <QObject>

#include <memory>
#include <vector>

// The application's undo stack. Owned by RkApp; rkUndoStack points at it.
// An entry is a caption and a list of commands, undone last first and redone in order. While an
// RkUndoStackHold is open, pushed commands join it; the outermost hold turns them into one entry
// when accepted, or takes them all back when cancelled.
class RKCORE_EXPORT RkUndoStack : public QObject
{
    Q_OBJECT
public:
    explicit RkUndoStack(QObject* parent = nullptr);
    ~RkUndoStack() override;

    // True while a hold is open.
    bool canPushItems() const;
    int holdDepth() const;

    bool canUndo() const;
    bool canRedo() const;
    QString getUndoCaption() const;
    QString getRedoCaption() const;
    int count() const;
    int index() const;

    // Records a change the caller has already made. With a hold open the command joins it;
    // otherwise it becomes an entry of its own under its caption. Ignored while the stack is
    // undoing or redoing.
    void push(std::unique_ptr<RkUndoCommand> command);

public Q_SLOTS:
    // Both do nothing while a hold is open.
    void undo();
    void redo();
    // Forgets every entry (a hold that is open keeps its own changes).
    void clear();

Q_SIGNALS:
    void undoCaptionChanged(const QString& caption);
    void redoCaptionChanged(const QString& caption);
    void canUndoChanged(bool on);
    void canRedoChanged(bool on);

private:
    friend class RkUndoStackHold;
    // Holds are known by an id that is never reused, so a hold closed along with an outer one
    // cannot close a later one.
    int openHold();
    int holdLevel(int id) const;
    void acceptHold(int id, const QString& caption);
    void cancelHold(int id);
    void addEntry(const QString& caption, std::vector<std::unique_ptr<RkUndoCommand>> commands);
    void notifyCaptions(const QString& oldUndo, const QString& oldRedo, bool oldCanUndo,
                        bool oldCanRedo);

    struct Private;
    std::unique_ptr<Private> d;
};

RKCORE_EXPORT extern RkUndoStack* rkUndoStack;
