#include "rkaboutplugins.h"

#include "plugin/rkclassfactory.h"
#include "plugin/rkplugin.h"
#include "plugin/rkpluginmgr.h"

#include <QDialogButtonBox>
#include <QHeaderView>
#include <QTreeWidget>
#include <QVBoxLayout>

RkAboutPluginsDialog::RkAboutPluginsDialog(RkPluginMgr* pluginMgr, QWidget* parent)
    : QDialog(parent)
{
    setObjectName(QStringLiteral("AboutPluginsDialog"));
    setWindowTitle(tr("About Plug-ins"));
    auto* layout = new QVBoxLayout(this);
    auto* tree = new QTreeWidget(this);
    tree->setObjectName(QStringLiteral("PluginTree"));
    tree->setColumnCount(2);
    tree->setHeaderLabels({tr("Plug-in / Class"), tr("Details")});
    const QList<RkPlugin*> plugins = pluginMgr->getPlugins();
    for (RkPlugin* plugin : plugins) {
        auto* top = new QTreeWidgetItem(
            tree, {plugin->getName(), RkPlugin::versionToString(plugin->getVersion())});
        new QTreeWidgetItem(top, {tr("Author"), plugin->getAuthor()});
        new QTreeWidgetItem(top, {tr("Version"), RkPlugin::versionToString(plugin->getVersion())});
        auto* description = new QTreeWidgetItem(top, {tr("Description"), plugin->getDescription()});
        description->setToolTip(1, plugin->getDescription());
        new QTreeWidgetItem(top, {tr("File"), pluginMgr->getPluginFilePath(plugin)});
        auto* classes = new QTreeWidgetItem(
            top, {tr("Classes"), QString::number(plugin->getNumClassFactories())});
        for (RkClassFactory* factory : plugin->getClassFactories())
            new QTreeWidgetItem(classes, {factory->className(), factory->getGUID().toString()});
        top->setExpanded(true);
    }
    tree->header()->setSectionResizeMode(0, QHeaderView::ResizeToContents);
    layout->addWidget(tree);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close, this);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    layout->addWidget(buttons);
    resize(640, 420);
}

QString rkPluginListing(RkPluginMgr* pluginMgr)
{
    QString text;
    for (RkPlugin* plugin : pluginMgr->getPlugins()) {
        text += QStringLiteral("%1\n").arg(plugin->getName());
        text += QStringLiteral("  file: %1\n").arg(pluginMgr->getPluginFilePath(plugin));
        text += QStringLiteral("  author: %1\n").arg(plugin->getAuthor());
        text +=
            QStringLiteral("  version: %1\n").arg(RkPlugin::versionToString(plugin->getVersion()));
        text += QStringLiteral("  description: %1\n").arg(plugin->getDescription());
        text += QStringLiteral("  classes:\n");
        for (RkClassFactory* factory : plugin->getClassFactories()) {
            text += QStringLiteral("    %1 %2\n")
                        .arg(factory->className(), factory->getGUID().toString());
        }
    }
    return text;
}
