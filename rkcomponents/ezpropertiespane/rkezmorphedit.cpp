#include "rkezmorphedit.h"

#include "properties/rkfloatproperty.h"
#include "rksourcewarning.h"
#include "scene/rkscene.h"
#include "undo/rkundostackhold.h"
#include "widgets/rkfloatslider.h"

#include <QSignalBlocker>

#include <cmath>

RkEzMorphEdit::RkEzMorphEdit() = default;

RkEzMorphEdit::~RkEzMorphEdit() = default;

void RkEzMorphEdit::start(RkFloatProperty* property, const char* where)
{
    if (m_hold) {
        RK_SOURCE_WARNING(
            QStringLiteral("Undo Stack already being held in %1!").arg(QLatin1String(where)));
        m_hold.reset();
        m_previewing = false;
    }
    if (!property)
        return;
    m_hold = std::make_unique<RkUndoStackHold>();
    property->beginEdit();
}

void RkEzMorphEdit::end(RkFloatProperty* property)
{
    if (property)
        property->finishEdit();
    if (m_hold) {
        const QString label = property ? property->getLabel() : QString();
        m_hold->accept(label.isEmpty() ? tr("Unnamed") : label);
        m_hold.reset();
    }
}

void RkEzMorphEdit::cancel(RkFloatProperty* property)
{
    if (property)
        property->cancelEdit();
    if (m_hold) {
        m_hold->cancel();
        m_hold.reset();
    }
}

void RkEzMorphEdit::beginPreview(RkFloatProperty* property)
{
    if (m_previewing || m_hold || !property || (rkScene && rkScene->isPlaying()))
        return;
    // Also false for a value that is not a number.
    if (!(std::abs(property->getValue()) < 0.5f))
        return;
    m_previewing = true;
    m_hold = std::make_unique<RkUndoStackHold>();
    property->beginEdit();
    property->adjustValue(1.f);
}

void RkEzMorphEdit::endPreview(RkFloatProperty* property)
{
    if (!m_previewing)
        return;
    m_previewing = false;
    // cancelEdit() puts the value back; cancelling the hold leaves nothing on the stack.
    cancel(property);
}

void RkEzMorphEdit::close(RkFloatProperty* property)
{
    if (m_previewing)
        endPreview(property);
    else if (m_hold)
        end(property);
}

void RkEzMorphEdit::drop()
{
    m_previewing = false;
    if (m_hold) {
        m_hold->cancel();
        m_hold.reset();
    }
}

void RkEzMorphEdit::configure(RkFloatSlider* slider, const RkFloatProperty* property)
{
    const QSignalBlocker blocker(slider);
    slider->setClamped(property->isClamped());
    slider->setMinMax(property->getMin(), property->getMax());
    slider->setDisplayAsPercent(property->getDisplayAsPercent());
    slider->setValue(property->getValue());
    slider->setSensitivity(property->getSensitivity());
    slider->update();
}
