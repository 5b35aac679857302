#pragma once

#include "rkcoreglobal.h"

#include <QString>

// Gathers the changes pushed while it lives (property values among them) into one undo entry.
// accept(caption) keeps them as an entry with that caption; cancel() takes every change back and
// leaves nothing on the stack. A hold destroyed undecided cancels. A hold opened while another is
// open folds into the outer one: its accept keeps its changes for the outer entry, its cancel
// takes back only the changes made since it was opened.
class RKCORE_EXPORT RkUndoStackHold
{
public:
    RkUndoStackHold();
    ~RkUndoStackHold();
    RkUndoStackHold(const RkUndoStackHold&) = delete;
    RkUndoStackHold& operator=(const RkUndoStackHold&) = delete;

    void accept(const QString& caption);
    void cancel();
    bool isOpen() const;

private:
    int m_id = 0;
};
