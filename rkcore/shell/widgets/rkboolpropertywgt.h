#pragma once

#include "widgets/rkbasicpropertywgt.h"

// Edits on/off properties with a check box labelled with the property's label. Properties that
// differ show the box partly checked; a click then turns them all on.
class RKCORE_EXPORT RkBoolPropertyWgt : public RkBasicPropertyWgt
{
    Q_OBJECT
public:
    explicit RkBoolPropertyWgt(QWidget* parent = nullptr, const QString& name = QString());
    ~RkBoolPropertyWgt() override;

    // Takes on/off properties only.
    void addProperty(RkProperty* property) override;
    void setSelected(bool selected) override;

protected:
    void updateFromProperties() override;

private:
    void boxClicked();

    struct Private;
    std::unique_ptr<Private> d;
};
