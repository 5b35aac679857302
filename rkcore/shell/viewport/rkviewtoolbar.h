#pragma once

#include "rkcoreglobal.h"

#include <QWidget>

class QHBoxLayout;

// The strip of controls at the top of a view: widgets gather at the left (side 0) or the right
// (side 1).
class RKCORE_EXPORT RkViewToolBar : public QWidget
{
    Q_OBJECT
public:
    enum Side { Left = 0, Right = 1 };

    explicit RkViewToolBar(QWidget* parent = nullptr);
    ~RkViewToolBar() override;

    // The tool bar becomes the widget's parent.
    void addWidget(QWidget* widget, int side = Left);

private:
    QHBoxLayout* m_left;
    QHBoxLayout* m_right;
};
