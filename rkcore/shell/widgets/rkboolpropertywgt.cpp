#include "widgets/rkboolpropertywgt.h"

#include "properties/rkboolproperty.h"

#include <QCheckBox>
#include <QLayout>

struct RkBoolPropertyWgt::Private {
    QCheckBox* box = nullptr;
};

RkBoolPropertyWgt::RkBoolPropertyWgt(QWidget* parent, const QString& name)
    : RkBasicPropertyWgt(parent, name), d(std::make_unique<Private>())
{
    d->box = new QCheckBox(this);
    d->box->setObjectName(QStringLiteral("BoolPropertyBox"));
    layout()->addWidget(d->box);
    connect(d->box, &QCheckBox::clicked, this, &RkBoolPropertyWgt::boxClicked);
    updateFromProperties();
}

RkBoolPropertyWgt::~RkBoolPropertyWgt() = default;

void RkBoolPropertyWgt::addProperty(RkProperty* property)
{
    if (qobject_cast<RkBoolProperty*>(property))
        RkBasicPropertyWgt::addProperty(property);
}

void RkBoolPropertyWgt::setSelected(bool selected)
{
    if (selected == isSelected())
        return;
    RkBasicPropertyWgt::setSelected(selected);
    // The box's text stays readable on the highlight; unselected it inherits again.
    QPalette palette;
    if (selected)
        palette.setBrush(QPalette::WindowText, this->palette().brush(QPalette::HighlightedText));
    d->box->setPalette(palette);
}

void RkBoolPropertyWgt::updateFromProperties()
{
    const auto* first = static_cast<const RkBoolProperty*>(getFirstProperty());
    const bool mixed = arePropertiesMixed();
    d->box->setText(first ? first->getLabel() : QString());
    d->box->setTristate(mixed);
    d->box->setCheckState(mixed                        ? Qt::PartiallyChecked
                          : first && first->getValue() ? Qt::Checked
                                                       : Qt::Unchecked);
    d->box->setEnabled(arePropertiesEditable());
    RkBasicPropertyWgt::updateFromProperties();
}

void RkBoolPropertyWgt::boxClicked()
{
    // The click already moved the box on: off and partly checked turn on, on turns off.
    const bool on = d->box->checkState() == Qt::Checked;
    beginPropertyEdit();
    writeProperties(
        [on](RkProperty* property) { static_cast<RkBoolProperty*>(property)->setValue(on); });
    finishPropertyEdit();
}
