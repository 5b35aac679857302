#pragma once

#include "rkcoreglobal.h"

#include <QString>
#include <QStringList>
#include <QVariantMap>

// A flat set of named values. The owner decides where it is stored (see RkPaneSettings).
class RKCORE_EXPORT RkSettings
{
public:
    RkSettings();
    virtual ~RkSettings();

    bool getBoolValue(const QString& key, bool defaultValue = false) const;
    void setBoolValue(const QString& key, bool value);
    int getIntValue(const QString& key, int defaultValue = 0) const;
    void setIntValue(const QString& key, int value);
    double getFloatValue(const QString& key, double defaultValue = 0.0) const;
    void setFloatValue(const QString& key, double value);
    QString getStringValue(const QString& key, const QString& defaultValue = QString()) const;
    void setStringValue(const QString& key, const QString& value);

    bool hasKey(const QString& key) const;
    void removeKey(const QString& key);
    QStringList keys() const;
    void clear();

    const QVariantMap& values() const { return m_values; }
    void setValues(const QVariantMap& values) { m_values = values; }

private:
    QVariantMap m_values;
};
