#include "io/rkinfile.h"

#include "io/rkfileformat.h"
#include "io/rkinfile_p.h"

#include <cmath>

using namespace RkFileFormat;

QString RkInFile::Private::where() const
{
    return QStringLiteral("section 0x%1 of object %2 (%3)")
        .arg(quint16(sectionId), 0, 16)
        .arg(currentObject)
        .arg(currentClass);
}

bool RkInFile::Private::need(RkInFile* file, int bytes)
{
    if (!error.isEmpty())
        return false;
    if (!inSection) {
        file->setError(QStringLiteral("a value was read outside a section"));
        return false;
    }
    if (bytes < 0 || end - pos < bytes) {
        file->setError(QStringLiteral("%1 ends before its values do").arg(where()));
        return false;
    }
    return true;
}

bool RkInFile::Private::readTag(RkInFile* file, quint8 expected)
{
    if (!need(file, 1))
        return false;
    const quint8 tag = quint8(data.at(pos));
    if (tag != expected) {
        file->setError(
            QStringLiteral("%1 holds %2 where %3 belongs")
                .arg(where(), QLatin1String(tagName(tag)), QLatin1String(tagName(expected))));
        return false;
    }
    pos++;
    return true;
}

RkInFile::RkInFile() : d(std::make_unique<Private>()) {}

RkInFile::~RkInFile() = default;

bool RkInFile::readInt(int& value)
{
    if (!d->readTag(this, TagInt) || !d->need(this, 4))
        return false;
    value = get<qint32>(d->data.constData() + d->pos);
    d->pos += 4;
    return true;
}

bool RkInFile::readFloat(float& value)
{
    if (!d->readTag(this, TagFloat) || !d->need(this, 4))
        return false;
    const quint32 bits = get<quint32>(d->data.constData() + d->pos);
    float v;
    std::memcpy(&v, &bits, 4);
    if (!std::isfinite(v)) {
        setError(QStringLiteral("%1 holds a value that is not a number").arg(d->where()));
        return false;
    }
    d->pos += 4;
    value = v;
    return true;
}

bool RkInFile::readDouble(double& value)
{
    if (!d->readTag(this, TagDouble) || !d->need(this, 8))
        return false;
    const quint64 bits = get<quint64>(d->data.constData() + d->pos);
    double v;
    std::memcpy(&v, &bits, 8);
    if (!std::isfinite(v)) {
        setError(QStringLiteral("%1 holds a value that is not a number").arg(d->where()));
        return false;
    }
    d->pos += 8;
    value = v;
    return true;
}

bool RkInFile::readBool(bool& value)
{
    if (!d->readTag(this, TagBool) || !d->need(this, 1))
        return false;
    const quint8 b = quint8(d->data.at(d->pos));
    if (b > 1) {
        setError(QStringLiteral("%1 holds a broken bool").arg(d->where()));
        return false;
    }
    d->pos++;
    value = b == 1;
    return true;
}

bool RkInFile::Private::readBytes(RkInFile* file, QByteArray& out)
{
    if (!need(file, 4))
        return false;
    const quint32 length = get<quint32>(data.constData() + pos);
    if (length > quint32(end - pos - 4)) {
        file->setError(QStringLiteral("%1 holds a length of %2 bytes that runs past its end")
                           .arg(where())
                           .arg(length));
        return false;
    }
    pos += 4;
    out = data.mid(pos, int(length));
    pos += int(length);
    return true;
}

bool RkInFile::readString(QString& value)
{
    QByteArray bytes;
    if (!d->readTag(this, TagString) || !d->readBytes(this, bytes))
        return false;
    value = QString::fromUtf8(bytes);
    return true;
}

bool RkInFile::readByteArray(QByteArray& value)
{
    QByteArray bytes;
    if (!d->readTag(this, TagBytes) || !d->readBytes(this, bytes))
        return false;
    value = bytes;
    return true;
}

QByteArray RkInFile::readByteArray()
{
    QByteArray bytes;
    readByteArray(bytes);
    return bytes;
}

int RkInFile::readPointer()
{
    if (hasError())
        return -1;
    if (d->inSection && d->pos == d->end)
        return 1;
    if (!d->readTag(this, TagPointer) || !d->need(this, 7))
        return -1;
    Private::PointerRef ref;
    ref.owner = d->currentObject;
    ref.section = d->sectionId;
    ref.kind = quint8(d->data.at(d->pos));
    ref.index = get<qint16>(d->data.constData() + d->pos + 1);
    ref.target = get<qint32>(d->data.constData() + d->pos + 3);
    d->pos += 7;
    switch (ref.kind) {
    case PointerNull:
        break;
    case PointerObject:
        break;
    case PointerProperty: {
        QByteArray name;
        if (!d->readBytes(this, name))
            return -1;
        ref.property = QString::fromUtf8(name);
        break;
    }
    default:
        setError(
            QStringLiteral("%1 holds a pointer of unknown kind %2").arg(d->where()).arg(ref.kind));
        return -1;
    }
    d->refs.append(ref);
    return 0;
}

short RkInFile::currentSection() const
{
    return d->sectionId;
}

bool RkInFile::atSectionEnd() const
{
    return !d->inSection || d->pos >= d->end;
}

QString RkInFile::fileName() const
{
    return d->fileName;
}

int RkInFile::formatVersion() const
{
    return d->version;
}

bool RkInFile::hasError() const
{
    return !d->error.isEmpty();
}

QString RkInFile::errorString() const
{
    return d->error;
}

void RkInFile::setError(const QString& message)
{
    if (d->error.isEmpty())
        d->error = message.isEmpty() ? QStringLiteral("unknown error") : message;
}
