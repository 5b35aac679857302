#pragma once

#include "undo/rkundocommand.h"

#include <QPointer>

class RkProperty;

// Records a change of a property's definition: its label, hidden state and lock, and for numeric
// properties the limits, clamping and memorized value, for float ones the sensitivity and percent
// display. Made before the change (it takes the state then), told afterChange() when the change is
// done, then pushed. Values are not part of it: value changes record themselves.
class RKCORE_EXPORT RkPropertyDefinitionCommand : public RkUndoCommand
{
public:
    explicit RkPropertyDefinitionCommand(RkProperty* property, const QString& caption = QString());
    ~RkPropertyDefinitionCommand() override;

    // Takes the property's state as it is now as the state after the change.
    void afterChange();

    void undo() override;
    void redo() override;
    const void* mergeKey() const override;
    void mergeWith(const RkUndoCommand& later) override;
    bool isNoChange() const override;

    struct State {
        QString label;
        int flags = 0;
        bool clamped = false;
        double min = 0, max = 0;
        double memorized = 0;
        float sensitivity = 0;
        bool percent = false;
        bool operator==(const State& other) const;
    };

private:
    static State read(const RkProperty* property);
    static void apply(RkProperty* property, const State& state);

    QPointer<RkProperty> m_property;
    State m_before;
    State m_after;
};
