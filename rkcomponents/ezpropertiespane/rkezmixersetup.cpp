#include "rkezmixersetup.h"

#include "rkezmixer.h"
#include "rkezmixercontrol.h"
#include "rkezmixers.h"
#include "scene/rknode.h"

namespace
{
constexpr int kControlSide = 85;
const QPoint kSlots[] = {{105, 42}, {168, 127}, {105, 212}, {42, 127},
                         {149, 66}, {149, 187}, {60, 187},  {60, 66}};
constexpr int kSlotCount = int(sizeof(kSlots) / sizeof(kSlots[0]));
} // namespace

RkEzMixers* RkEzMixerSetup::findMixers(RkNode* figure)
{
    return figure ? qobject_cast<RkEzMixers*>(figure->findDataItem(QStringLiteral("RkEzMixers")))
                  : nullptr;
}

RkEzMixer* RkEzMixerSetup::addMixer(RkNode* figure)
{
    if (!figure)
        return nullptr;
    RkEzMixers* mixers = findMixers(figure);
    if (!mixers) {
        mixers = new RkEzMixers;
        figure->addDataItem(mixers); // the node owns it from here on
    }
    auto* mixer = new RkEzMixer;
    mixers->addMixer(mixer);
    return mixer;
}

QString RkEzMixerSetup::tabText(int position)
{
    return QStringLiteral("Mixer %1").arg(position);
}

RkEzMixerControl* RkEzMixerSetup::addControl(RkEzMixer* mixer, RkFloatProperty* property,
                                             const QImage& thumbnail)
{
    if (!mixer || !property)
        return nullptr;
    auto* control = new RkEzMixerControl;
    control->setImage(controlImage(thumbnail));
    control->setControlProperty(property);
    const QPoint point = slotPoint(mixer->getControls().size());
    control->setX(point.x());
    control->setY(point.y());
    mixer->addControl(control);
    return control;
}

QImage RkEzMixerSetup::controlImage(const QImage& thumbnail)
{
    if (thumbnail.isNull())
        return QImage();
    const int side = thumbnail.height();
    return thumbnail.copy(thumbnail.width() / 2 - side / 2, 0, side, side)
        .scaled(kControlSide, kControlSide, Qt::KeepAspectRatioByExpanding,
                Qt::SmoothTransformation);
}

QPoint RkEzMixerSetup::slotPoint(int index)
{
    return kSlots[((index % kSlotCount) + kSlotCount) % kSlotCount];
}
