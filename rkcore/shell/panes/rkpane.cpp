#include "panes/rkpane.h"

#include "actions/rkactionmenu.h"
#include "panes/rkpanesettings.h"

#include <QDockWidget>
#include <QMenu>

struct RkPane::Private {
    QString label;
    std::unique_ptr<RkActionMenu> installedMenu;
    std::unique_ptr<RkActionMenu> builtMenu;
    int builtVersion = -1;
};

RkPane::RkPane(const QString& label, QWidget* parent)
    : QWidget(parent), d(std::make_unique<Private>())
{
    d->label = label;
    setWindowTitle(label);
}

RkPane::~RkPane() = default;

QString RkPane::getLabel() const
{
    return d->label;
}

void RkPane::setOptionsMenu(RkActionMenu* menu)
{
    d->installedMenu.reset(menu);
}

RkActionMenu* RkPane::getOptionsMenu()
{
    if (d->installedMenu)
        return d->installedMenu.get();
    const int version = getOptionsMenuVersion();
    if (!d->builtMenu || d->builtVersion != version) {
        auto menu = std::make_unique<RkActionMenu>();
        buildOptionsMenu(menu.get());
        d->builtMenu = menu->isEmpty() ? nullptr : std::move(menu);
        d->builtVersion = version;
    }
    return d->builtMenu.get();
}

void RkPane::fillOptionsMenu(QMenu* menu)
{
    if (RkActionMenu* options = getOptionsMenu())
        options->buildMenu(menu);
}

void RkPane::refresh() {}

void RkPane::hidePane()
{
    if (auto* dock = qobject_cast<QDockWidget*>(parentWidget()))
        dock->close();
    else
        hide();
}

void RkPane::showEvent(QShowEvent* event)
{
    QWidget::showEvent(event);
    refresh();
}

void RkPane::hideEvent(QHideEvent* event)
{
    QWidget::hideEvent(event);
}

void RkPane::restoreSettings(const RkPaneSettings&) {}

void RkPane::buildOptionsMenu(RkActionMenu*) const {}

int RkPane::getOptionsMenuVersion() const
{
    return 0;
}

void RkPane::saveSettings(RkPaneSettings&) const {}
