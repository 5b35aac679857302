#pragma once

#include <QFrame>
#include <QPointer>
#include <QVector>

class RkEzMixer;
class RkEzMixerControl;
class RkEzMixerControlWgt;
class RkEzMixerDriverWgt;

// One mixer as a page of the Shape tab: a sunken field on which the mixer's handle and its
// controls' thumbnails sit at their points. The page shows the mixer; it does not own it.
class RkEzMixerWgt : public QFrame
{
    Q_OBJECT
public:
    RkEzMixerWgt(QWidget* parent, RkEzMixer* mixer);
    ~RkEzMixerWgt() override;

    RkEzMixer* getMixer() const;
    RkEzMixerDriverWgt* getDriverWgt() const;
    // The thumbnails of the mixer's controls, in the mixer's order.
    QVector<RkEzMixerControlWgt*> getControlWgts() const;
    // Puts a control that was just added to the mixer on the page, above everything else.
    RkEzMixerControlWgt* addControlWgt(RkEzMixerControl* control);

private:
    // The figure's mixer list owns the mixer; the guard covers a mixer removed first.
    QPointer<RkEzMixer> m_mixer;
    RkEzMixerDriverWgt* m_driverWgt = nullptr;
};
