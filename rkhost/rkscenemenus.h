#pragma once

#include <QObject>

#include <memory>

class QAction;
class RkMainWindow;

// The host's File menu (New, Open, Save, Save As, Import) and Edit menu (Undo and Redo, named after
// what they take back or do again). A file that cannot be opened leaves the scene as it was and
// the user is told why in a message box, as are model files of the scene that are missing.
class RkSceneMenus : public QObject
{
    Q_OBJECT
public:
    explicit RkSceneMenus(RkMainWindow* window);
    ~RkSceneMenus() override;

    QAction* newAction() const;
    QAction* openAction() const;
    QAction* saveAction() const;
    QAction* saveAsAction() const;
    QAction* importAction() const;
    QAction* undoAction() const;
    QAction* redoAction() const;

public Q_SLOTS:
    void newScene();
    // Ask for a file with a dialog.
    void open();
    void save();
    void saveAs();
    // The same without a dialog; false when it failed (the user has been told).
    bool openScene(const QString& path);
    bool saveScene(const QString& path);
    // Ask for a model file to import, with a filter of every format the importer reads.
    void importModel();
    // Adds the model as a new node, selected and framed; false when refused or cancelled. A
    // scene file (.rks) is opened instead.
    bool importFile(const QString& path);

private:
    void updateUndoRedo();
    void updateTitle();
    void tellUser(const QString& title, const QString& message);

    struct Private;
    std::unique_ptr<Private> d;
};
