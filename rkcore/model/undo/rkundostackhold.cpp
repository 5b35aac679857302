#include "undo/rkundostackhold.h"

#include "undo/rkundostack.h"

RkUndoStackHold::RkUndoStackHold()
{
    if (rkUndoStack)
        m_id = rkUndoStack->openHold();
}

RkUndoStackHold::~RkUndoStackHold()
{
    cancel();
}

void RkUndoStackHold::accept(const QString& caption)
{
    if (m_id == 0)
        return;
    if (rkUndoStack)
        rkUndoStack->acceptHold(m_id, caption);
    m_id = 0;
}

void RkUndoStackHold::cancel()
{
    if (m_id == 0)
        return;
    if (rkUndoStack)
        rkUndoStack->cancelHold(m_id);
    m_id = 0;
}

bool RkUndoStackHold::isOpen() const
{
    return m_id != 0 && rkUndoStack && rkUndoStack->holdLevel(m_id) >= 0;
}
