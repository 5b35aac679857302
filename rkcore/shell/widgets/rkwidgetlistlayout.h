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

    // A list emptied and filled again (RkWidgetGroup::release() and settle()) stays shown from
    // beginRefill() to endRefill() while its groups take their widgets back in place. The first
    // group or widget that has to be shown hides the layout's widget until endRefill(): each
    // widget shown in a shown list has every layout around it recomputed at once, which a long
    // fill cannot afford, while showing the list once at the end lays it out once.
    void beginRefill();
    void endRefill();
    bool isRefilling() const;
    // The groups call this before they show something.
    void aboutToShow();

private:
    bool m_refilling = false;
    bool m_hidden = false;
};
