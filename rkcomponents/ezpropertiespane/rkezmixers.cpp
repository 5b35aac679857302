#include "rkezmixers.h"

#include "io/rkinfile.h"
#include "io/rkoutfile.h"
#include "rkassertcast.h"
#include "rkezmixer.h"

namespace
{
constexpr short kMixersSection = 0x210;
}

RkEzMixers::RkEzMixers() : RkElementData(QStringLiteral("RkEzMixers"), true) {}

RkEzMixers::~RkEzMixers()
{
    qDeleteAll(m_mixers);
    m_mixers.clear();
}

const QVector<RkEzMixer*>& RkEzMixers::getMixers() const
{
    return m_mixers;
}

void RkEzMixers::addMixer(RkEzMixer* mixer)
{
    if (!mixer || m_mixers.contains(mixer))
        return;
    mixer->setParent(this);
    m_mixers.append(mixer);
}

void RkEzMixers::removeMixer(RkEzMixer* mixer)
{
    const int i = m_mixers.indexOf(mixer);
    if (i < 0)
        return;
    m_mixers.remove(i);
    mixer->deleteLater();
}

void RkEzMixers::loadSection(RkInFile* file, short sectionId)
{
    if (sectionId != kMixersSection) {
        RkElementData::loadSection(file, sectionId);
        return;
    }
    while (file->readPointer() == 0) {
    }
}

void RkEzMixers::postLoadFile(RkInFile*) {}

void RkEzMixers::setPointer(const RkInFile*, short sectionId, short, RkBase* object)
{
    if (sectionId != kMixersSection)
        return;
    // A missing mixer is left out rather than kept as an empty tab.
    if (RkEzMixer* mixer = rkAssertCast<RkEzMixer>(object))
        addMixer(mixer);
}

void RkEzMixers::save(RkOutFile* file) const
{
    file->startSection(kMixersSection);
    for (int i = 0; i < m_mixers.size(); ++i)
        file->writePointer(m_mixers[i], short(i));
    file->endSection();
}
