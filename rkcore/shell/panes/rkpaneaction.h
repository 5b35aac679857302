#pragma once

#include "actions/rkaction.h"

// Shows and hides the pane of one class. Checkable; its check mark follows the pane's visibility,
// whoever shows or hides the pane. Listed under Window > Panes.
class RKCORE_EXPORT RkPaneAction : public RkAction
{
    Q_OBJECT
public:
    explicit RkPaneAction(const QString& paneClassName, QObject* parent = nullptr);
    ~RkPaneAction() override;

    QString getPaneClassName() const;

    QString getActionGroup() const override;
    QString getDefaultMenuPath() const override;
    // Takes the pane's tab label as text and starts following the pane's visibility.
    void init() override;
    void toggleAction(bool onOff) override;

private:
    void paneVisibilityChanged(const QString& paneClassName, bool visible);

    QString m_paneClassName;
};
