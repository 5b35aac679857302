#pragma once

#include <QCoreApplication>

#include <memory>

class RkFloatProperty;
class RkFloatSlider;
class RkUndoStackHold;

// The one undo hold of a morph's tile or list row: either a slider gesture, kept as one entry
// named after the morph, or a hover preview at full strength, always taken back. The owner keeps
// the morph behind a guard and passes it in (null once its node deleted it).
class RkEzMorphEdit
{
    Q_DECLARE_TR_FUNCTIONS(RkEzMorphEdit)
public:
    RkEzMorphEdit();
    ~RkEzMorphEdit();

    // where names the caller in the warning about a gesture that began inside another.
    void start(RkFloatProperty* property, const char* where);
    void end(RkFloatProperty* property);
    void cancel(RkFloatProperty* property);

    // Dials the morph in at full strength for a look; not while an edit holds the stack, while
    // the scene plays, or when the morph is already at half strength or more.
    void beginPreview(RkFloatProperty* property);
    void endPreview(RkFloatProperty* property);
    bool isPreviewing() const { return m_previewing; }

    // For an owner that goes: a gesture keeps what it did, a preview goes back.
    void close(RkFloatProperty* property);
    // The morph is gone already: the hold is dropped without touching it.
    void drop();

    // Gives the slider the morph's limits, clamping, percent display, value and sensitivity.
    static void configure(RkFloatSlider* slider, const RkFloatProperty* property);

private:
    std::unique_ptr<RkUndoStackHold> m_hold;
    bool m_previewing = false;
};
