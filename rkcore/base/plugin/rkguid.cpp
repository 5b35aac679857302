#include "plugin/rkguid.h"

#include <QHash>

RkGUID RkGUID::fromString(const QString& text)
{
    const QString trimmed = text.trimmed();
    QUuid uuid(trimmed.startsWith(QLatin1Char('{')) ? trimmed : QLatin1Char('{') + trimmed + '}');
    RkGUID guid;
    if (uuid.isNull())
        return guid;
    guid.m_text = text;
    guid.m_uuid = uuid;
    return guid;
}

uint qHash(const RkGUID& guid, uint seed)
{
    return qHash(guid.toUuid(), seed);
}
