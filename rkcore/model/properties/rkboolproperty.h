#pragma once

#include "properties/rkproperty.h"

// An on/off property.
class RKCORE_EXPORT RkBoolProperty : public RkProperty
{
    Q_OBJECT
public:
    RkBoolProperty(const QString& name, const QString& label, QObject* parent = nullptr);
    ~RkBoolProperty() override;

    bool getValue() const;
    bool setValue(bool value);
    bool getDefaultValue() const;
    void setDefaultValue(bool value);

    QString widgetClassName() const override;
    QVariant getValueVariant() const override;
    bool setValueVariant(const QVariant& value) override;
    void saveState(RkOutFile* file) const override;
    void loadState(RkInFile* file) override;

private:
    bool storeValue(bool value);

    bool m_value = false;
    bool m_default = false;
};
