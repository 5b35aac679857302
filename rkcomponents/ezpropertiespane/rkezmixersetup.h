#pragma once

#include <QImage>
#include <QPoint>
#include <QString>

class RkEzMixer;
class RkEzMixerControl;
class RkEzMixers;
class RkFloatProperty;
class RkNode;

// What the Shape tab does to a figure's mixers when the user adds one or drops a tile on one.
// None of it is undoable.
class RkEzMixerSetup
{
public:
    // The mixers kept on the figure, or null when it has none (or there is no figure).
    static RkEzMixers* findMixers(RkNode* figure);
    // Appends a new mixer to the figure, making its mixer list first when it has none.
    static RkEzMixer* addMixer(RkNode* figure);
    // The text of the mixer tab at a 1-based position; tabs are numbered by position only.
    static QString tabText(int position);

    // Makes a control of the morph on the mixer at the next slot point, at full value, with the
    // tile's thumbnail cut to a square. Null when there is no mixer or no morph.
    static RkEzMixerControl* addControl(RkEzMixer* mixer, RkFloatProperty* property,
                                        const QImage& thumbnail);
    // The centred square of a thumbnail, scaled to a control's 85 by 85; null stays null.
    static QImage controlImage(const QImage& thumbnail);
    // The point of a control slot: four around the driver's start, then the diagonals; the
    // ninth control reuses the first slot.
    static QPoint slotPoint(int index);
};
