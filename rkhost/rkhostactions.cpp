#include "rkhostactions.h"

#include "actions/rkaction.h"
#include "actions/rkactionmgr.h"
#include "app/rkapp.h"
#include "app/rkmainwindow.h"
#include "rkaboutplugins.h"

namespace
{

class RkQuitAction : public RkAction
{
    Q_OBJECT
public:
    RkQuitAction() : RkAction(tr("&Quit"), tr("Quit the application")) {}
    QString getActionGroup() const override { return tr("File"); }
    QString getDefaultMenuPath() const override { return QStringLiteral("&File"); }
    QKeySequence getDefaultAccel() const override { return QKeySequence::Quit; }
    void executeAction() override
    {
        if (RkMainWindow* mainWindow = rkApp ? rkApp->getInterface() : nullptr)
            mainWindow->close();
    }
};

class RkAboutPluginsAction : public RkAction
{
    Q_OBJECT
public:
    RkAboutPluginsAction()
        : RkAction(tr("About &Plug-ins..."), tr("List the loaded plug-ins and their classes"))
    {
    }
    QString getActionGroup() const override { return tr("Help"); }
    QString getDefaultMenuPath() const override { return QStringLiteral("&Help"); }
    void executeAction() override
    {
        RkMainWindow* mainWindow = rkApp ? rkApp->getInterface() : nullptr;
        if (!mainWindow)
            return;
        auto* dialog = new RkAboutPluginsDialog(rkApp->getPluginMgr(), mainWindow);
        dialog->setAttribute(Qt::WA_DeleteOnClose);
        dialog->show();
    }
};

} // namespace

void rkAddHostActions(RkMainWindow* mainWindow)
{
    mainWindow->getActionMgr()->addAction(new RkQuitAction);
    mainWindow->getActionMgr()->addAction(new RkAboutPluginsAction);
}

#include "rkhostactions.moc"
