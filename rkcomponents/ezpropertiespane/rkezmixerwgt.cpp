#include "rkezmixerwgt.h"

#include "rkezmixer.h"
#include "rkezmixercontrolwgt.h"
#include "rkezmixerdriverwgt.h"

#include <QStyle>

RkEzMixerWgt::RkEzMixerWgt(QWidget* parent, RkEzMixer* mixer) : QFrame(parent), m_mixer(mixer)
{
    setObjectName(QStringLiteral("ShapeMixerPage"));
    setContentsMargins(0, 0, style()->pixelMetric(QStyle::PM_CustomBase), 0);
    setFrameStyle(QFrame::StyledPanel | QFrame::Sunken);
    setLineWidth(1);
    // No layout: children sit at their points. The handle stays above the thumbnails: a mixer
    // saved with its handle on a control would otherwise open with the handle out of reach.
    m_driverWgt = new RkEzMixerDriverWgt(this, mixer ? mixer->getDriver() : nullptr);
    if (mixer) {
        for (RkEzMixerControl* control : mixer->getControls())
            new RkEzMixerControlWgt(this, control);
    }
    m_driverWgt->raise();
}

RkEzMixerWgt::~RkEzMixerWgt() = default;

RkEzMixer* RkEzMixerWgt::getMixer() const
{
    return m_mixer.data();
}

RkEzMixerDriverWgt* RkEzMixerWgt::getDriverWgt() const
{
    return m_driverWgt;
}

QVector<RkEzMixerControlWgt*> RkEzMixerWgt::getControlWgts() const
{
    // Raising a thumbnail reorders the children, so the mixer gives the order. A deleted
    // thumbnail lingers until the event loop takes it, but its control has left the mixer.
    QVector<RkEzMixerControlWgt*> wgts;
    if (!m_mixer)
        return wgts;
    const QList<RkEzMixerControlWgt*> all =
        findChildren<RkEzMixerControlWgt*>(QString(), Qt::FindDirectChildrenOnly);
    for (RkEzMixerControl* control : m_mixer->getControls()) {
        for (RkEzMixerControlWgt* wgt : all) {
            if (wgt->getControl() == control)
                wgts.append(wgt);
        }
    }
    return wgts;
}

RkEzMixerControlWgt* RkEzMixerWgt::addControlWgt(RkEzMixerControl* control)
{
    auto* wgt = new RkEzMixerControlWgt(this, control);
    wgt->show();
    m_driverWgt->raise();
    return wgt;
}
