#include "viewport/rkviewtool.h"

#include "actions/rkactionmenu.h"

struct RkViewTool::Private {
    std::unique_ptr<RkActionMenu> optionsMenu;
    QIcon icon;
};

RkViewTool::RkViewTool(const QString& name, QObject* parent)
    : QObject(parent), d(std::make_unique<Private>())
{
    setObjectName(name);
}

RkViewTool::~RkViewTool() = default;

QWidget* RkViewTool::getOptionsWidget(QWidget*)
{
    return nullptr;
}

RkActionMenu* RkViewTool::getOptionsMenu() const
{
    return d->optionsMenu.get();
}

void RkViewTool::setOptionsMenu(RkActionMenu* menu)
{
    d->optionsMenu.reset(menu);
    Q_EMIT rebuildMenu();
}

QIcon RkViewTool::getIcon() const
{
    return d->icon;
}

void RkViewTool::setIcon(const QIcon& icon)
{
    d->icon = icon;
}
