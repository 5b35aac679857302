#include "rklabelpropertywgt.h"

#include "properties/rkproperty.h"

#include <QLabel>
#include <QLayout>

RkLabelPropertyWgt::RkLabelPropertyWgt(QWidget* parent, const QString& name)
    : RkBasicPropertyWgt(parent, name)
{
    m_label = new QLabel(this);
    m_label->setObjectName(QStringLiteral("LabelPropertyText"));
    // Presses reach the widget itself, so the list can select the line.
    m_label->setAttribute(Qt::WA_TransparentForMouseEvents);
    layout()->addWidget(m_label);
}

RkLabelPropertyWgt::~RkLabelPropertyWgt() = default;

bool RkLabelPropertyWgt::doOptionsDialog()
{
    return false;
}

void RkLabelPropertyWgt::updateFromProperties()
{
    const RkProperty* first = getFirstProperty();
    m_label->setText(first ? first->getLabel() : QString());
    RkBasicPropertyWgt::updateFromProperties();
}
