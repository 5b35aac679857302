#include "actions/rkhelpmgr.h"

#include "actions/rkaction.h"

#include <QWidget>

namespace
{
const char* const helpTopicProperty = "rkHelpTopic";

QString plainText(QString text)
{
    // "&&" stands for a literal ampersand; a single one marks the mnemonic.
    text.replace(QLatin1String("&&"), QLatin1String("\x01"));
    text.remove(QLatin1Char('&'));
    text.replace(QLatin1Char('\x01'), QLatin1Char('&'));
    return text;
}
} // namespace

RkHelpMgr::RkHelpMgr(QObject* parent) : QObject(parent) {}

RkHelpMgr::~RkHelpMgr() = default;

void RkHelpMgr::setOnlineHelp(RkAction* action)
{
    if (!action)
        return;
    action->setProperty(helpTopicProperty, QString::fromLatin1(action->metaObject()->className()));
    action->setToolTip(plainText(action->text()));
    action->setStatusTip(action->getDescription());
    action->setWhatsThis(action->getDescription());
}

void RkHelpMgr::setOnlineHelp(QWidget* widget)
{
    if (widget)
        widget->setProperty(helpTopicProperty, widget->objectName());
}

void RkHelpMgr::setOnlineHelp(QWidget* widget, const QString& title, const QString& toolTip,
                              const QString& statusTip, const QString& whatsThis)
{
    if (!widget)
        return;
    const QString tip = toolTip.isEmpty() ? title : toolTip;
    widget->setProperty(helpTopicProperty, title.isEmpty() ? widget->objectName() : title);
    widget->setToolTip(tip);
    widget->setStatusTip(statusTip.isEmpty() ? tip : statusTip);
    widget->setWhatsThis(whatsThis);
}

bool RkHelpMgr::hasOnlineHelp(const QObject* object)
{
    return object && object->property(helpTopicProperty).isValid();
}
