#include "properties/rkpropertydefinitioncommand.h"

#include "properties/rkfloatproperty.h"
#include "properties/rkintproperty.h"

bool RkPropertyDefinitionCommand::State::operator==(const State& other) const
{
    return label == other.label && flags == other.flags && clamped == other.clamped &&
           min == other.min && max == other.max && memorized == other.memorized &&
           sensitivity == other.sensitivity && percent == other.percent;
}

RkPropertyDefinitionCommand::RkPropertyDefinitionCommand(RkProperty* property,
                                                         const QString& caption)
    : RkUndoCommand(caption), m_property(property), m_before(read(property)), m_after(m_before)
{
}

RkPropertyDefinitionCommand::~RkPropertyDefinitionCommand() = default;

void RkPropertyDefinitionCommand::afterChange()
{
    m_after = read(m_property);
}

void RkPropertyDefinitionCommand::undo()
{
    apply(m_property, m_before);
}

void RkPropertyDefinitionCommand::redo()
{
    apply(m_property, m_after);
}

const void* RkPropertyDefinitionCommand::mergeKey() const
{
    return m_property.data();
}

void RkPropertyDefinitionCommand::mergeWith(const RkUndoCommand& later)
{
    m_after = static_cast<const RkPropertyDefinitionCommand&>(later).m_after;
}

bool RkPropertyDefinitionCommand::isNoChange() const
{
    return !m_property || m_before == m_after;
}

RkPropertyDefinitionCommand::State RkPropertyDefinitionCommand::read(const RkProperty* property)
{
    State state;
    if (!property)
        return state;
    state.label = property->getLabel();
    state.flags = property->getFlags();
    if (auto* f = qobject_cast<const RkFloatProperty*>(property)) {
        state.clamped = f->isClamped();
        state.min = f->getMin();
        state.max = f->getMax();
        state.memorized = f->getMemorizedValue();
        state.sensitivity = f->getSensitivity();
        state.percent = f->getDisplayAsPercent();
    } else if (auto* i = qobject_cast<const RkIntProperty*>(property)) {
        state.clamped = i->isClamped();
        state.min = i->getMin();
        state.max = i->getMax();
        state.memorized = i->getMemorizedValue();
    }
    return state;
}

void RkPropertyDefinitionCommand::apply(RkProperty* property, const State& state)
{
    if (!property)
        return;
    property->setLabel(state.label);
    property->setFlags(state.flags);
    if (auto* f = qobject_cast<RkFloatProperty*>(property)) {
        f->setMinMax(float(state.min), float(state.max));
        f->setClamped(state.clamped);
        // Left alone when equal, so a property that never memorized keeps following its default.
        if (f->getMemorizedValue() != float(state.memorized))
            f->setMemorizedValue(float(state.memorized));
        f->setSensitivity(state.sensitivity);
        f->setDisplayAsPercent(state.percent);
    } else if (auto* i = qobject_cast<RkIntProperty*>(property)) {
        i->setMinMax(int(state.min), int(state.max));
        i->setClamped(state.clamped);
        if (i->getMemorizedValue() != int(state.memorized))
            i->setMemorizedValue(int(state.memorized));
    }
}
