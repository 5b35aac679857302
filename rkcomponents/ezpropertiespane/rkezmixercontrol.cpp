#include "rkezmixercontrol.h"

#include "io/rkinfile.h"
#include "io/rkoutfile.h"
#include "properties/rkfloatproperty.h"
#include "rkassertcast.h"

#include <QBuffer>
#include <QPointer>

namespace
{
constexpr short kPropertySection = 0x221;
constexpr short kImageSection = 0x222;
constexpr short kPointSection = 0x223;
} // namespace

struct RkEzMixerControl::Private {
    RkEzMixer* mixer = nullptr;
    // The morph belongs to its node; the guard turns null when the node deletes it.
    QPointer<RkFloatProperty> property;
    float value = 0.f;
    QImage image;
    int x = 0;
    int y = 0;
};

RkEzMixerControl::RkEzMixerControl() : RkBase(nullptr, QString()), d(new Private) {}

RkEzMixerControl::~RkEzMixerControl() = default;

RkEzMixer* RkEzMixerControl::getMixer() const
{
    return d->mixer;
}

void RkEzMixerControl::setMixer(RkEzMixer* mixer)
{
    d->mixer = mixer;
}

RkFloatProperty* RkEzMixerControl::getControlProperty() const
{
    return d->property.data();
}

void RkEzMixerControl::setControlProperty(RkFloatProperty* property)
{
    if (d->property != property)
        d->property = property;
    d->value = 1.f;
}

float RkEzMixerControl::getValue() const
{
    return d->value;
}

void RkEzMixerControl::setValue(float value)
{
    d->value = value;
}

QImage RkEzMixerControl::getImage() const
{
    return d->image;
}

void RkEzMixerControl::setImage(const QImage& image)
{
    d->image = image;
}

int RkEzMixerControl::getX() const
{
    return d->x;
}

int RkEzMixerControl::getY() const
{
    return d->y;
}

void RkEzMixerControl::setX(int x)
{
    d->x = x;
}

void RkEzMixerControl::setY(int y)
{
    d->y = y;
}

QPoint RkEzMixerControl::getPoint() const
{
    return QPoint(d->x, d->y);
}

void RkEzMixerControl::loadSection(RkInFile* file, short sectionId)
{
    switch (sectionId) {
    case kImageSection:
        // An image that does not decode leaves the control without a thumbnail.
        d->image = QImage::fromData(file->readByteArray(), "PNG");
        break;
    case kPropertySection: {
        file->readPointer();
        float value = 0.f;
        if (file->readFloat(value))
            d->value = value;
        break;
    }
    case kPointSection: {
        int x = 0, y = 0;
        if (file->readInt(x) && file->readInt(y)) {
            d->x = x;
            d->y = y;
        }
        break;
    }
    default:
        RkBase::loadSection(file, sectionId);
    }
}

void RkEzMixerControl::postLoadFile(RkInFile*) {}

void RkEzMixerControl::setPointer(const RkInFile*, short sectionId, short, RkBase* object)
{
    // The loaded value stays: it is the property's value at full weight, not a fresh default.
    if (sectionId == kPropertySection)
        d->property = rkAssertCast<RkFloatProperty>(object);
}

void RkEzMixerControl::save(RkOutFile* file) const
{
    QByteArray png;
    QBuffer buffer(&png);
    buffer.open(QIODevice::WriteOnly);
    d->image.save(&buffer, "PNG");
    file->writeByteArraySection(kImageSection, png);

    file->startSection(kPropertySection);
    file->writePointer(d->property.data(), 0);
    file->writeFloat(d->value);
    file->endSection();

    file->startSection(kPointSection);
    file->writeInt(d->x);
    file->writeInt(d->y);
    file->endSection();
}
