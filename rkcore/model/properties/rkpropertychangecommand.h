#pragma once

#include "undo/rkundocommand.h"

#include <QPointer>
#include <QVariant>

class RkProperty;

// A property's value change, applied through setValueVariant. Changes of one property fold into
// one; a property deleted since is left alone.
class RKCORE_EXPORT RkPropertyChangeCommand : public RkUndoCommand
{
public:
    RkPropertyChangeCommand(RkProperty* property, const QVariant& before, const QVariant& after);
    ~RkPropertyChangeCommand() override;

    void undo() override;
    void redo() override;
    const void* mergeKey() const override;
    void mergeWith(const RkUndoCommand& later) override;
    bool isNoChange() const override;

private:
    QPointer<RkProperty> m_property;
    QVariant m_before;
    QVariant m_after;
};
