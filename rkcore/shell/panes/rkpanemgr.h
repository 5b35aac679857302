#pragma once

#include "rkcoreglobal.h"

#include <QList>
#include <QObject>

#include <memory>

class QDockWidget;
class QSettings;
class QMainWindow;
class RkPane;

// Creates panes through their class factories, docks them in the main window (tabbed together on
// the right), shows each pane's options menu from a button on its dock, and keeps every pane
// class's settings between runs. Owned by the main window.
class RKCORE_EXPORT RkPaneMgr : public QObject
{
    Q_OBJECT
public:
    explicit RkPaneMgr(QMainWindow* mainWindow);
    ~RkPaneMgr() override;

    // The pane manager of the newest main window still alive (the one rkApp->getInterface()
    // answers), or null.
    static RkPaneMgr* current();

    // The pane of that class if it has been created, else null.
    RkPane* findPane(const QString& className) const;
    // The pane of that class, created and docked (visible) the first time; null with one log
    // line when no factory makes an RkPane of that name.
    RkPane* createPane(const QString& className);
    // Docks a pane made by the host itself; the main window owns it from here on.
    void addPane(RkPane* pane);
    // Creates every registered pane class that has no pane yet.
    void createPanes();
    QList<RkPane*> getPanes() const;

    QDockWidget* getDockWidget(const RkPane* pane) const;
    // Shows (creating it when needed) or closes the pane of that class.
    void showPane(const QString& className, bool show);
    bool isPaneVisible(const QString& className) const;

    // Writes every pane's settings to the settings store (also done when the main window goes).
    void saveSettings();
    // Uses an INI file at this path as the settings store instead of the user's host settings.
    void setSettingsFile(const QString& filePath);

Q_SIGNALS:
    void paneCreated(RkPane* pane);
    // A pane's dock was shown or closed.
    void paneVisibilityChanged(const QString& className, bool visible);

private:
    std::unique_ptr<QSettings> openStore() const;
    QDockWidget* dockPane(RkPane* pane);

    struct Private;
    std::unique_ptr<Private> d;
};
