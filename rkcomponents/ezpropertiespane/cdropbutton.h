#pragma once

#include <QPointer>
#include <QPushButton>

class QDropEvent;
class RkEzPropertiesControl;
class RkEzPropertiesWgt;

// The drop target under the icon grid: a morph tile dropped on it becomes a control of a custom
// mixer of the Shape tab. Only tiles are accepted.
class CDropButton : public QPushButton
{
    Q_OBJECT
public:
    CDropButton(QWidget* parent, RkEzPropertiesWgt* target);
    ~CDropButton() override;

protected:
    void dragEnterEvent(QDragEnterEvent* event) override;
    void dropEvent(QDropEvent* event) override;

private:
    RkEzPropertiesControl* tileOf(const QDropEvent* event) const;

    QPointer<RkEzPropertiesWgt> m_target;
};
