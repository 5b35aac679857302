#include "rkezpropertiespane.h"

#include "rkezpropertieswgt.h"

#include <QVBoxLayout>

RkEzPropertiesPane::RkEzPropertiesPane() : RkPane(QStringLiteral("Shape"))
{
    auto* layout = new QVBoxLayout(this);
    m_wgt = new RkEzPropertiesWgt(this);
    layout->addWidget(m_wgt);
    setMinimumSize(minimumSizeHint());
}

RkEzPropertiesPane::~RkEzPropertiesPane() = default;

RkEzPropertiesWgt* RkEzPropertiesPane::getPropertiesWgt() const
{
    return m_wgt;
}
