#include "io/rkoutfile.h"

#include "io/rkfileformat.h"
#include "io/rkoutfile_p.h"

#include <cmath>

using namespace RkFileFormat;

RkOutFile::RkOutFile() : d(std::make_unique<Private>()) {}

RkOutFile::~RkOutFile() = default;

void RkOutFile::startSection(short id)
{
    if (d->inSection) {
        setError(
            QStringLiteral("section 0x%1 started inside another section").arg(quint16(id), 0, 16));
        return;
    }
    d->inSection = true;
    put<quint16>(d->sections, quint16(id));
    d->lengthPos = d->sections.size();
    put<quint32>(d->sections, 0);
}

void RkOutFile::endSection()
{
    if (!d->inSection) {
        setError(QStringLiteral("a section was ended that was never started"));
        return;
    }
    const quint32 length = quint32(d->sections.size() - d->lengthPos - 4);
    qToLittleEndian(length, d->sections.data() + d->lengthPos);
    d->inSection = false;
    d->sectionCount++;
}

static bool checkInSection(RkOutFile* file, bool inSection)
{
    if (!inSection)
        file->setError(QStringLiteral("a value was written outside a section"));
    return inSection;
}

void RkOutFile::writeInt(int value)
{
    if (!checkInSection(this, d->inSection))
        return;
    d->sections.append(char(TagInt));
    put<qint32>(d->sections, qint32(value));
}

void RkOutFile::writeFloat(float value)
{
    if (!checkInSection(this, d->inSection))
        return;
    if (!std::isfinite(value)) {
        setError(QStringLiteral("a value that is not a number was written"));
        return;
    }
    quint32 bits;
    std::memcpy(&bits, &value, 4);
    d->sections.append(char(TagFloat));
    put<quint32>(d->sections, bits);
}

void RkOutFile::writeDouble(double value)
{
    if (!checkInSection(this, d->inSection))
        return;
    if (!std::isfinite(value)) {
        setError(QStringLiteral("a value that is not a number was written"));
        return;
    }
    quint64 bits;
    std::memcpy(&bits, &value, 8);
    d->sections.append(char(TagDouble));
    put<quint64>(d->sections, bits);
}

void RkOutFile::writeBool(bool value)
{
    if (!checkInSection(this, d->inSection))
        return;
    d->sections.append(char(TagBool));
    d->sections.append(char(value ? 1 : 0));
}

void RkOutFile::writeString(const QString& value)
{
    if (!checkInSection(this, d->inSection))
        return;
    d->sections.append(char(TagString));
    putString(d->sections, value);
}

void RkOutFile::writeByteArray(const QByteArray& value)
{
    if (!checkInSection(this, d->inSection))
        return;
    d->sections.append(char(TagBytes));
    put<quint32>(d->sections, quint32(value.size()));
    d->sections.append(value);
}

void RkOutFile::writePointer(const RkBase* object, short index)
{
    if (!checkInSection(this, d->inSection))
        return;
    quint8 kind = PointerNull;
    qint32 target = -1;
    QString property;
    if (object && d->resolve && !d->resolve(object, kind, target, property))
        return;
    d->sections.append(char(TagPointer));
    d->sections.append(char(kind));
    put<qint16>(d->sections, qint16(index));
    put<qint32>(d->sections, target);
    if (kind == PointerProperty)
        putString(d->sections, property);
}

void RkOutFile::writePointerSection(short id, const RkBase* object, short index)
{
    startSection(id);
    writePointer(object, index);
    endSection();
}

void RkOutFile::writeByteArraySection(short id, const QByteArray& bytes)
{
    startSection(id);
    writeByteArray(bytes);
    endSection();
}

bool RkOutFile::hasError() const
{
    return !d->error.isEmpty();
}

QString RkOutFile::errorString() const
{
    return d->error;
}

void RkOutFile::setError(const QString& message)
{
    if (d->error.isEmpty())
        d->error = message.isEmpty() ? QStringLiteral("unknown error") : message;
}

QString RkOutFile::fileName() const
{
    return d->fileName;
}
