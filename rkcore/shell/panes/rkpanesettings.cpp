#include "panes/rkpanesettings.h"

#include <QSettings>

RkPaneSettings::RkPaneSettings(const QString& paneClassName) : m_paneClassName(paneClassName) {}

RkPaneSettings::~RkPaneSettings() = default;

void RkPaneSettings::load(QSettings& store)
{
    clear();
    store.beginGroup(QStringLiteral("Panes/") + m_paneClassName);
    QVariantMap values;
    for (const QString& key : store.childKeys())
        values.insert(key, store.value(key));
    store.endGroup();
    setValues(values);
}

void RkPaneSettings::store(QSettings& store) const
{
    store.beginGroup(QStringLiteral("Panes/") + m_paneClassName);
    store.remove(QString());
    for (auto it = values().constBegin(); it != values().constEnd(); ++it)
        store.setValue(it.key(), it.value());
    store.endGroup();
}
