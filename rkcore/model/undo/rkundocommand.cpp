#include "undo/rkundocommand.h"

RkUndoCommand::RkUndoCommand(const QString& caption) : m_caption(caption) {}

RkUndoCommand::~RkUndoCommand() = default;

QString RkUndoCommand::caption() const
{
    return m_caption;
}

void RkUndoCommand::setCaption(const QString& caption)
{
    m_caption = caption;
}

const void* RkUndoCommand::mergeKey() const
{
    return nullptr;
}

void RkUndoCommand::mergeWith(const RkUndoCommand&) {}

bool RkUndoCommand::isNoChange() const
{
    return false;
}
