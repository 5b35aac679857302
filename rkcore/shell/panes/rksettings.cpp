#include "panes/rksettings.h"

RkSettings::RkSettings() = default;

RkSettings::~RkSettings() = default;

// Values read back from a settings file arrive as strings; each getter converts and falls back to
// the default when the stored text is not of its type.
bool RkSettings::getBoolValue(const QString& key, bool defaultValue) const
{
    const QVariant v = m_values.value(key);
    if (!v.isValid())
        return defaultValue;
    if (v.type() == QVariant::String) {
        const QString s = v.toString().toLower();
        if (s == QLatin1String("true") || s == QLatin1String("1"))
            return true;
        if (s == QLatin1String("false") || s == QLatin1String("0"))
            return false;
        return defaultValue;
    }
    return v.canConvert<bool>() ? v.toBool() : defaultValue;
}

void RkSettings::setBoolValue(const QString& key, bool value)
{
    m_values.insert(key, value);
}

int RkSettings::getIntValue(const QString& key, int defaultValue) const
{
    bool ok = false;
    const int value = m_values.value(key).toInt(&ok);
    return ok ? value : defaultValue;
}

void RkSettings::setIntValue(const QString& key, int value)
{
    m_values.insert(key, value);
}

double RkSettings::getFloatValue(const QString& key, double defaultValue) const
{
    bool ok = false;
    const double value = m_values.value(key).toDouble(&ok);
    return ok ? value : defaultValue;
}

void RkSettings::setFloatValue(const QString& key, double value)
{
    m_values.insert(key, value);
}

QString RkSettings::getStringValue(const QString& key, const QString& defaultValue) const
{
    const QVariant v = m_values.value(key);
    return v.isValid() ? v.toString() : defaultValue;
}

void RkSettings::setStringValue(const QString& key, const QString& value)
{
    m_values.insert(key, value);
}

bool RkSettings::hasKey(const QString& key) const
{
    return m_values.contains(key);
}

void RkSettings::removeKey(const QString& key)
{
    m_values.remove(key);
}

QStringList RkSettings::keys() const
{
    return m_values.keys();
}

void RkSettings::clear()
{
    m_values.clear();
}
