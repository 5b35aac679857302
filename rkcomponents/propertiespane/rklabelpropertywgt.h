#pragma once

#include "widgets/rkbasicpropertywgt.h"

class QLabel;

// Shows the label of its first property and nothing to edit. It has no class factory: the
// property list makes it itself.
class RkLabelPropertyWgt : public RkBasicPropertyWgt
{
    Q_OBJECT
public:
    RkLabelPropertyWgt(QWidget* parent, const QString& name);
    ~RkLabelPropertyWgt() override;

    bool doOptionsDialog() override;

protected:
    void updateFromProperties() override;

private:
    QLabel* m_label = nullptr;
};
