#pragma once

#include "rksymmetry.h"

#include <QDialog>

class QRadioButton;

// Asks which way Symmetry copies the pose; the mirroring itself is RkSymmetry::mirror.
class RkSymmetryDialog : public QDialog
{
    Q_OBJECT
public:
    explicit RkSymmetryDialog(QWidget* parent = nullptr);

    RkSymmetry::Direction direction() const;

private:
    QRadioButton* m_leftToRight = nullptr;
    QRadioButton* m_rightToLeft = nullptr;
};
