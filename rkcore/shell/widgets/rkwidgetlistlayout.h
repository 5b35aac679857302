#pragma once

#include "rkcoreglobal.h"

#include <QBoxLayout>

// The vertical layout that a list of widget groups lives in: each top-level RkWidgetGroup made
// with this layout adds itself at its end, as a child of the layout's widget. Sub-groups live in
// the body of their parent group, not here.
class RKCORE_EXPORT RkWidgetListLayout : public QBoxLayout
{
    Q_OBJECT
public:
    explicit RkWidgetListLayout(QWidget* parent = nullptr);
    ~RkWidgetListLayout() override;
};
