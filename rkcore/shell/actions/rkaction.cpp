#include "actions/rkaction.h"

#include "actions/rkhelpmgr.h"

struct RkAction::Private {
    QString description;
};

RkAction::RkAction(const QString& text, const QString& description, QObject* parent)
    : QAction(text, parent), d(std::make_unique<Private>())
{
    d->description = description;
    connect(this, &QAction::triggered, this, [this](bool checked) {
        if (isCheckable())
            toggleAction(checked);
        else
            executeAction();
    });
}

RkAction::~RkAction() = default;

QString RkAction::getDescription() const
{
    return d->description;
}

void RkAction::setDescription(const QString& description)
{
    d->description = description;
    updateOnlineHelp();
}

void RkAction::setEnabled(bool enabled)
{
    QAction::setEnabled(enabled);
}

QString RkAction::getActionGroup() const
{
    return tr("Miscellaneous");
}

QString RkAction::getDefaultMenuPath() const
{
    return QString();
}

QString RkAction::getDefaultToolBar() const
{
    return QString();
}

QKeySequence RkAction::getDefaultAccel() const
{
    return QKeySequence();
}

void RkAction::init() {}

void RkAction::styleChange() {}

void RkAction::updateOnlineHelp()
{
    if (RkHelpMgr::hasOnlineHelp(this))
        RkHelpMgr::setOnlineHelp(this);
}

void RkAction::executeAction() {}

void RkAction::toggleAction(bool) {}
