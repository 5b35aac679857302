#include "rkeztabbar.h"

#include <QMouseEvent>

RkEzTabBar::RkEzTabBar(QWidget* parent) : QTabBar(parent) {}

RkEzTabBar::~RkEzTabBar() = default;

bool RkEzTabBar::isActive() const
{
    return m_active;
}

int RkEzTabBar::currentIndex() const
{
    return m_active ? QTabBar::currentIndex() : -1;
}

void RkEzTabBar::setCurrentIndex(int index)
{
    const int previous = QTabBar::currentIndex();
    QTabBar::setCurrentIndex(index);
    if (index == -1) {
        if (m_active) {
            m_active = false;
            Q_EMIT currentChanged(-1);
            update();
        }
    } else if (index == previous && !m_active) {
        m_active = true;
        Q_EMIT currentChanged(index);
        update();
    }
}

void RkEzTabBar::mousePressEvent(QMouseEvent* event)
{
    if (m_active) {
        QTabBar::mousePressEvent(event);
        return;
    }
    if (event->button() != Qt::LeftButton) {
        event->ignore();
        return;
    }
    const int tab = tabAt(event->pos());
    if (tab >= 0)
        setCurrentIndex(tab);
}
