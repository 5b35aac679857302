#pragma once

#include <QEvent>

// Posted by a property list to itself after a rebuild: the remembered vertical scroll position
// is applied once the event loop has laid the rebuilt list out.
class RkPropertyPaneListScrollEvent : public QEvent
{
public:
    static constexpr QEvent::Type EventType = QEvent::Type(QEvent::User + 24);

    explicit RkPropertyPaneListScrollEvent(int position);
    ~RkPropertyPaneListScrollEvent() override;

    int position() const { return m_position; }

private:
    int m_position = 0;
};
