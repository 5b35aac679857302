#pragma once

#include <QTabBar>

// A tab bar that can have no selected tab: the Shape tab's two rows act as one selection, so
// choosing a tab in one row leaves the other without one. While inactive, currentIndex() is -1
// although the bar still draws its last current tab; a left click on any tab, that one included,
// selects it again.
class RkEzTabBar : public QTabBar
{
    Q_OBJECT
public:
    explicit RkEzTabBar(QWidget* parent = nullptr);
    ~RkEzTabBar() override;

    bool isActive() const;
    // These hide QTabBar's own: -1 when inactive.
    int currentIndex() const;
    // -1 makes the bar inactive; selecting the current tab of an inactive bar activates it
    // again and reports the change.
    void setCurrentIndex(int index);

protected:
    void mousePressEvent(QMouseEvent* event) override;

private:
    bool m_active = true;
};
