#pragma once

#include "rkcoreglobal.h"

#include <QString>
#include <QUuid>

// A class identifier. It keeps the text exactly as it was given (stored scenes and module tables
// carry mixed-case GUIDs that must round-trip unchanged) and compares by the 128-bit value, so
// "4dec" and "4DEC" name the same class.
class RKCORE_EXPORT RkGUID
{
public:
    RkGUID() = default;

    // Parses "XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX", with or without braces. Text that is not a
    // GUID gives a null RkGUID.
    static RkGUID fromString(const QString& text);

    QString toString() const { return m_text; }
    bool isNull() const { return m_uuid.isNull(); }
    const QUuid& toUuid() const { return m_uuid; }

    bool operator==(const RkGUID& other) const { return m_uuid == other.m_uuid; }
    bool operator!=(const RkGUID& other) const { return m_uuid != other.m_uuid; }

private:
    QString m_text;
    QUuid m_uuid;
};

RKCORE_EXPORT uint qHash(const RkGUID& guid, uint seed = 0);
