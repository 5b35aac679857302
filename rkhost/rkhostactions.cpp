#include "rkhostactions.h"

#include "actions/rkaction.h"
#include "actions/rkactionmgr.h"
#include "app/rkapp.h"
#include "app/rkmainwindow.h"
#include "geometry/rkgeometry.h"
#include "geometry/rkmap.h"
#include "rkaboutplugins.h"
#include "scene/rknode.h"
#include "scene/rkobject.h"
#include "scene/rkscene.h"
#include "viewport/rkviewport.h"
#include "viewport/rkviewportmgr.h"

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

// Brings the active viewport's 3D picture back in place of a view (a UV view, for example).
class Rk3DViewAction : public RkAction
{
    Q_OBJECT
public:
    Rk3DViewAction() : RkAction(tr("3D View"), tr("Show the 3D picture of the scene")) {}
    QString getActionGroup() const override { return tr("View Selection"); }
    QString getDefaultMenuPath() const override { return QStringLiteral("&View"); }
    void executeAction() override
    {
        RkMainWindow* mainWindow = rkApp ? rkApp->getInterface() : nullptr;
        if (RkViewport* viewport =
                mainWindow ? mainWindow->getViewportMgr()->getActiveViewport() : nullptr)
            viewport->setView(nullptr);
    }
};

// Mirrors the UV layout of the primary selection's mesh left to right within its own bounds (a
// demo figure's bone carries one island or two), so that UV changes reach whoever shows them.
class RkFlipUVsAction : public RkAction
{
    Q_OBJECT
public:
    RkFlipUVsAction() : RkAction(tr("Flip UVs of Selection"), tr("Mirror the selected node's UVs"))
    {
    }
    QString getActionGroup() const override { return tr("Edit"); }
    QString getDefaultMenuPath() const override { return QStringLiteral("&Edit"); }
    void executeAction() override
    {
        RkNode* node = rkScene ? rkScene->getPrimarySelection() : nullptr;
        RkObject* object = node ? node->getObject() : nullptr;
        RkGeometry* geometry = object ? object->getGeometry() : nullptr;
        RkPnt2* uvs = geometry ? geometry->getUVs()->getPnt2ArrayPtr() : nullptr;
        if (!uvs)
            return;
        const int n = geometry->getUVs()->getNumValues();
        float low = uvs[0].x;
        float high = uvs[0].x;
        for (int i = 1; i < n; ++i) {
            low = qMin(low, uvs[i].x);
            high = qMax(high, uvs[i].x);
        }
        for (int i = 0; i < n; ++i)
            uvs[i].x = low + high - uvs[i].x;
        object->notifyUVsChanged();
    }
};

} // namespace

void rkAddHostActions(RkMainWindow* mainWindow)
{
    mainWindow->getActionMgr()->addAction(new RkQuitAction);
    mainWindow->getActionMgr()->addAction(new RkAboutPluginsAction);
    mainWindow->getActionMgr()->addAction(new Rk3DViewAction);
    mainWindow->getActionMgr()->addAction(new RkFlipUVsAction);
}

#include "rkhostactions.moc"
