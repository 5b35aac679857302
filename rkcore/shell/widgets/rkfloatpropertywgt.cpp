#include "widgets/rkfloatpropertywgt.h"

#include "properties/rkfloatproperty.h"
#include "properties/rkpropertydefinitioncommand.h"
#include "undo/rkundostack.h"
#include "undo/rkundostackhold.h"
#include "widgets/rkfloatslider.h"

#include <QCheckBox>
#include <QDialog>
#include <QDialogButtonBox>
#include <QFormLayout>
#include <QLabel>
#include <QLineEdit>
#include <QSignalBlocker>

#include <cmath>

namespace
{

// The options of a float property, checked before the dialog may close: limits and sensitivity
// must be finite floats, the minimum no greater than the maximum, the sensitivity above zero.
class FloatOptionsDialog : public QDialog
{
public:
    FloatOptionsDialog(const RkFloatProperty* property, QWidget* parent) : QDialog(parent)
    {
        setObjectName(QStringLiteral("FloatPropertyOptions"));
        setWindowTitle(RkFloatPropertyWgt::tr("%1 Options").arg(property->getLabel()));
        auto* form = new QFormLayout(this);
        label = addEdit(form, QStringLiteral("LabelEdit"), RkFloatPropertyWgt::tr("Label"),
                        property->getLabel());
        min = addEdit(form, QStringLiteral("MinEdit"), RkFloatPropertyWgt::tr("Minimum"),
                      number(property->getMin()));
        max = addEdit(form, QStringLiteral("MaxEdit"), RkFloatPropertyWgt::tr("Maximum"),
                      number(property->getMax()));
        clamped = addCheck(form, QStringLiteral("ClampedCheck"),
                           RkFloatPropertyWgt::tr("Clamp to limits"), property->isClamped());
        sensitivity =
            addEdit(form, QStringLiteral("SensitivityEdit"), RkFloatPropertyWgt::tr("Sensitivity"),
                    number(property->getSensitivity()));
        percent =
            addCheck(form, QStringLiteral("PercentCheck"),
                     RkFloatPropertyWgt::tr("Display as percent"), property->getDisplayAsPercent());
        hidden = addCheck(form, QStringLiteral("HiddenCheck"), RkFloatPropertyWgt::tr("Hidden"),
                          property->isHidden());
        error = new QLabel(this);
        error->setObjectName(QStringLiteral("ErrorText"));
        error->setWordWrap(true);
        form->addRow(error);
        auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel, this);
        connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
        connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
        form->addRow(buttons);
    }

    void accept() override
    {
        const auto fail = [this](QLineEdit* field, const QString& message) {
            error->setText(message);
            field->setFocus();
            field->selectAll();
        };
        if (!read(min, &minValue))
            return fail(min, RkFloatPropertyWgt::tr("The minimum must be a number."));
        if (!read(max, &maxValue))
            return fail(max, RkFloatPropertyWgt::tr("The maximum must be a number."));
        if (minValue > maxValue)
            return fail(min, RkFloatPropertyWgt::tr("The minimum must not exceed the maximum."));
        if (!read(sensitivity, &sensitivityValue) || sensitivityValue <= 0)
            return fail(sensitivity,
                        RkFloatPropertyWgt::tr("The sensitivity must be a number above zero."));
        error->clear();
        QDialog::accept();
    }

    QLineEdit* label = nullptr;
    QLineEdit* min = nullptr;
    QLineEdit* max = nullptr;
    QLineEdit* sensitivity = nullptr;
    QCheckBox* clamped = nullptr;
    QCheckBox* percent = nullptr;
    QCheckBox* hidden = nullptr;
    QLabel* error = nullptr;
    float minValue = 0, maxValue = 0, sensitivityValue = 0;

private:
    static QString number(float value) { return QString::number(double(value), 'g', 7); }

    static bool read(const QLineEdit* field, float* value)
    {
        bool ok = false;
        const double v = field->text().trimmed().toDouble(&ok);
        if (!ok || !std::isfinite(float(v)))
            return false;
        *value = float(v);
        return true;
    }

    QLineEdit* addEdit(QFormLayout* form, const QString& name, const QString& text,
                       const QString& value)
    {
        auto* edit = new QLineEdit(value, this);
        edit->setObjectName(name);
        form->addRow(text, edit);
        return edit;
    }

    QCheckBox* addCheck(QFormLayout* form, const QString& name, const QString& text, bool on)
    {
        auto* check = new QCheckBox(text, this);
        check->setObjectName(name);
        check->setChecked(on);
        form->addRow(check);
        return check;
    }
};

} // namespace

struct RkFloatPropertyWgt::Private {
    RkFloatSlider* slider = nullptr;
};

RkFloatPropertyWgt::RkFloatPropertyWgt(QWidget* parent, const QString& name)
    : RkBasicPropertyWgt(parent, name), d(std::make_unique<Private>())
{
    d->slider = new RkFloatSlider(this, QStringLiteral("FloatPropertySlider"));
    attachSlider(d->slider);
    connect(d->slider, &RkFloatSlider::valueChanged, this, &RkFloatPropertyWgt::sliderValueChanged);
    updateFromProperties();
}

RkFloatPropertyWgt::~RkFloatPropertyWgt() = default;

void RkFloatPropertyWgt::addProperty(RkProperty* property)
{
    // Limits, clamping and percent display reach the widget through RkProperty::changed().
    if (qobject_cast<RkFloatProperty*>(property))
        RkBasicPropertyWgt::addProperty(property);
}

void RkFloatPropertyWgt::setIsMouseOverSlider(bool on)
{
    setSliderBarOnHover(on);
}

bool RkFloatPropertyWgt::isMouseOverSlider() const
{
    return isSliderBarOnHover();
}

void RkFloatPropertyWgt::updateFromProperties()
{
    if (const auto* first = static_cast<const RkFloatProperty*>(getFirstProperty())) {
        const QSignalBlocker blocker(d->slider);
        d->slider->setClamped(first->isClamped());
        d->slider->setMinMax(first->getMin(), first->getMax());
        d->slider->setSensitivity(first->getSensitivity());
        d->slider->setDefaultValue(first->getDefaultValue());
        d->slider->setDisplayAsPercent(first->getDisplayAsPercent());
        d->slider->setValue(first->getValue());
    }
    RkBasicPropertyWgt::updateFromProperties();
}

void RkFloatPropertyWgt::sliderValueChanged(float value)
{
    // Only a gesture writes: outside one nothing could undo the change.
    if (!isPropertyEditOpen())
        return;
    writeProperties([value](RkProperty* property) {
        static_cast<RkFloatProperty*>(property)->adjustValue(value);
    });
}

bool RkFloatPropertyWgt::doOptionsDialog()
{
    const auto* first = static_cast<const RkFloatProperty*>(getFirstProperty());
    if (!first || !arePropertiesEditable())
        return false;
    FloatOptionsDialog dialog(first, this);
    if (dialog.exec() != QDialog::Accepted)
        return false;
    const QString label = dialog.label->text();
    const bool clamped = dialog.clamped->isChecked();
    RkUndoStackHold hold;
    writeProperties([&](RkProperty* property) {
        auto* p = static_cast<RkFloatProperty*>(property);
        auto definition = std::make_unique<RkPropertyDefinitionCommand>(p);
        p->setLabel(label);
        p->setMinMax(dialog.minValue, dialog.maxValue);
        p->setClamped(clamped);
        p->setSensitivity(dialog.sensitivityValue);
        p->setDisplayAsPercent(dialog.percent->isChecked());
        p->setHidden(dialog.hidden->isChecked());
        // New limits hold for the value at once.
        definition->afterChange();
        if (rkUndoStack)
            rkUndoStack->push(std::move(definition));
        if (clamped)
            p->adjustValue(p->getValue());
    });
    hold.accept(undoCaption());
    return true;
}
