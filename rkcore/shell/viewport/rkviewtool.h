#pragma once

#include "rkcoreglobal.h"

#include <QIcon>
#include <QObject>

#include <memory>

class QWidget;
class RkActionMenu;

// A viewport tool (rotate, translate, select...). Its object name is the name the user sees. The
// Tool pane shows its options widget and, in the pane's options menu, its options menu.
class RKCORE_EXPORT RkViewTool : public QObject
{
    Q_OBJECT
public:
    explicit RkViewTool(const QString& name, QObject* parent = nullptr);
    ~RkViewTool() override;

    // The tool's options widget, or null when it has none. The caller puts the widget into its own
    // layout and so becomes its parent; a tool that keeps its widget must guard it (QPointer) and
    // make a new one once the old one is gone.
    virtual QWidget* getOptionsWidget(QWidget* parent);
    // The tool's options menu, or null when it has none. The tool keeps ownership.
    virtual RkActionMenu* getOptionsMenu() const;
    // Replaces the options menu (the tool owns it from here on; null removes it) and emits
    // rebuildMenu().
    void setOptionsMenu(RkActionMenu* menu);

    QIcon getIcon() const;
    void setIcon(const QIcon& icon);

Q_SIGNALS:
    // The options menu has changed; whoever shows it builds it again.
    void rebuildMenu();

private:
    struct Private;
    std::unique_ptr<Private> d;
};
