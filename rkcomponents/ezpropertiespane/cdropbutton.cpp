#include "cdropbutton.h"

#include "properties/rkfloatproperty.h"
#include "rkezicongridwgt.h"
#include "rkezpropertiescontrol.h"
#include "rkezpropertieswgt.h"

#include <QDragEnterEvent>
#include <QDropEvent>
#include <QMimeData>

CDropButton::CDropButton(QWidget* parent, RkEzPropertiesWgt* target)
    : QPushButton(QStringLiteral("Drop here to add to a Custom Mixer"), parent), m_target(target)
{
    setAcceptDrops(true);
}

CDropButton::~CDropButton() = default;

RkEzPropertiesControl* CDropButton::tileOf(const QDropEvent* event) const
{
    if (auto* tile = qobject_cast<RkEzPropertiesControl*>(event->source()))
        return tile;
    // A drag whose source is not known here (one replayed by the window system or a test)
    // names its tile by label; only the tiles of this button's grid qualify.
    const QMimeData* mime = event->mimeData();
    auto* grid = qobject_cast<RkEzIconGridWgt*>(parentWidget());
    if (!grid || !mime || !mime->hasFormat(QStringLiteral("text")))
        return nullptr;
    const QString label = QString::fromLatin1(mime->data(QStringLiteral("text")));
    for (RkEzPropertiesControl* tile : grid->getTiles()) {
        if (tile->getProperty() && tile->getProperty()->getLabel() == label)
            return tile;
    }
    return nullptr;
}

void CDropButton::dragEnterEvent(QDragEnterEvent* event)
{
    if (tileOf(event))
        event->acceptProposedAction();
}

void CDropButton::dropEvent(QDropEvent* event)
{
    RkEzPropertiesControl* tile = tileOf(event);
    if (!tile)
        return;
    event->acceptProposedAction();
    if (m_target)
        m_target->addControlToMixer(tile);
}
