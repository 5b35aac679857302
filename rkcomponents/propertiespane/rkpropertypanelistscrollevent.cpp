#include "rkpropertypanelistscrollevent.h"

RkPropertyPaneListScrollEvent::RkPropertyPaneListScrollEvent(int position)
    : QEvent(EventType), m_position(position)
{
}

RkPropertyPaneListScrollEvent::~RkPropertyPaneListScrollEvent() = default;
