#pragma once

#include "scene/rkelementdata.h"

#include <QVector>

class RkEzMixer;

// The custom mixers of a figure, kept on its node as the element data "RkEzMixers" and stored
// with the scene. The order of the mixers is the order of the Shape tab's mixer tabs.
class RkEzMixers : public RkElementData
{
    Q_OBJECT
public:
    RkEzMixers();
    ~RkEzMixers() override;

    const QVector<RkEzMixer*>& getMixers() const;
    // Takes ownership of the mixer and appends it.
    void addMixer(RkEzMixer* mixer);
    // Takes the mixer out at once; the event loop deletes it.
    void removeMixer(RkEzMixer* mixer);

    void loadSection(RkInFile* file, short sectionId) override;
    void postLoadFile(RkInFile* file) override;
    void setPointer(const RkInFile* file, short sectionId, short index, RkBase* object) override;
    void save(RkOutFile* file) const override;

private:
    QVector<RkEzMixer*> m_mixers;
};
