#pragma once

#include <QDialog>
#include <QString>

class RkPluginMgr;

// Help > About Plug-ins: every loaded module with its name, author, dotted version, description and
// classes.
class RkAboutPluginsDialog : public QDialog
{
    Q_OBJECT
public:
    explicit RkAboutPluginsDialog(RkPluginMgr* pluginMgr, QWidget* parent = nullptr);
};

// The same listing as plain text, one module after the other (used by --list-plugins).
QString rkPluginListing(RkPluginMgr* pluginMgr);
