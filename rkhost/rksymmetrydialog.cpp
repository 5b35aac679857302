#include "rksymmetrydialog.h"

#include <QDialogButtonBox>
#include <QLabel>
#include <QRadioButton>
#include <QVBoxLayout>

RkSymmetryDialog::RkSymmetryDialog(QWidget* parent) : QDialog(parent)
{
    setWindowTitle(tr("Symmetry"));
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(new QLabel(tr("Copy the pose of the figure's bones:"), this));
    m_leftToRight = new QRadioButton(tr("&Left side to right side"), this);
    m_rightToLeft = new QRadioButton(tr("&Right side to left side"), this);
    m_leftToRight->setChecked(true);
    layout->addWidget(m_leftToRight);
    layout->addWidget(m_rightToLeft);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel, this);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    layout->addWidget(buttons);
}

RkSymmetry::Direction RkSymmetryDialog::direction() const
{
    return m_rightToLeft->isChecked() ? RkSymmetry::Direction::RightToLeft
                                      : RkSymmetry::Direction::LeftToRight;
}
