#pragma once

#include "panes/rksettings.h"

class QSettings;

// The settings of one pane class, kept between runs in the host's settings file under the pane's
// class name. The pane manager loads them before restoreSettings() and stores them after
// saveSettings().
class RKCORE_EXPORT RkPaneSettings : public RkSettings
{
public:
    explicit RkPaneSettings(const QString& paneClassName = QString());
    ~RkPaneSettings() override;

    QString getPaneClassName() const { return m_paneClassName; }

    void load(QSettings& store);
    void store(QSettings& store) const;

private:
    QString m_paneClassName;
};
