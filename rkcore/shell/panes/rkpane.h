#pragma once

#include "rkcoreglobal.h"

#include <QWidget>

#include <memory>

class QMenu;
class RkActionMenu;
class RkPaneSettings;

// Base of every dockable pane. The pane manager docks it under its tab label, shows its options
// menu from a button on the dock, and loads and stores its settings.
class RKCORE_EXPORT RkPane : public QWidget
{
    Q_OBJECT
public:
    explicit RkPane(const QString& label, QWidget* parent = nullptr);
    ~RkPane() override;

    QString getLabel() const;

    // Installs the options menu; the pane owns the menu from here on and deletes the one before.
    void setOptionsMenu(RkActionMenu* menu);
    // The installed options menu, or else one made by buildOptionsMenu() (made again whenever
    // getOptionsMenuVersion() changes). Null when neither gives any entry.
    RkActionMenu* getOptionsMenu();
    // Fills a QMenu from the options menu; this is what the dock's options button shows.
    void fillOptionsMenu(QMenu* menu);

public Q_SLOTS:
    virtual void refresh();
    // Closes the pane (its dock, when docked).
    void hidePane();

protected:
    void showEvent(QShowEvent* event) override;
    void hideEvent(QHideEvent* event) override;

public:
    virtual void restoreSettings(const RkPaneSettings& settings);
    virtual void buildOptionsMenu(RkActionMenu* menu) const;
    virtual int getOptionsMenuVersion() const;
    virtual void saveSettings(RkPaneSettings& settings) const;

private:
    struct Private;
    std::unique_ptr<Private> d;
};
