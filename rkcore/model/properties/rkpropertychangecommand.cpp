#include "properties/rkpropertychangecommand.h"

#include "properties/rkproperty.h"

RkPropertyChangeCommand::RkPropertyChangeCommand(RkProperty* property, const QVariant& before,
                                                 const QVariant& after)
    : m_property(property), m_before(before), m_after(after)
{
}

RkPropertyChangeCommand::~RkPropertyChangeCommand() = default;

void RkPropertyChangeCommand::undo()
{
    if (m_property)
        m_property->setValueVariant(m_before);
}

void RkPropertyChangeCommand::redo()
{
    if (m_property)
        m_property->setValueVariant(m_after);
}

const void* RkPropertyChangeCommand::mergeKey() const
{
    return m_property.data();
}

void RkPropertyChangeCommand::mergeWith(const RkUndoCommand& later)
{
    // The stack folds only commands of the same class.
    m_after = static_cast<const RkPropertyChangeCommand&>(later).m_after;
}

bool RkPropertyChangeCommand::isNoChange() const
{
    return !m_property || m_before == m_after;
}
