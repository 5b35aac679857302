#pragma once

#include "viewport/rkview.h"

#include <memory>

class RkMaterial;
class RkMenuButton;
class RkNode;
class RkUVWgt;

// Shows, in place of a viewport's 3D picture, the UV layouts of the selected materials (mode 0)
// or of the selected nodes (mode 1; a figure counts as its bones). It follows the selection and
// the uvsChanged() of what it shows through one posted event, so many changes in a row cost one
// rebuild; while the scene loads it waits and rebuilds once at the end.
class RkUVView : public RkView
{
    Q_OBJECT
public:
    enum { RefreshEvent = 1025 }; // QEvent::User + 1

    RkUVView();
    ~RkUVView() override;

    QString getLabel() const override;
    QIcon getIcon() const override;
    void buildToolBar() override;

    RkUVWgt* getUVWgt() const;
    RkMenuButton* getModeButton() const;
    int getViewMode() const;
    bool isRefreshPending() const;

    // Writes the shown records as a size by size PNG with a transparent background: the unit
    // square filling the picture. False with the reason in error when the file cannot be written.
    bool exportLayout(const QString& path, int size, QString* error = nullptr) const;

public Q_SLOTS:
    void postRefreshEvent();
    void changeViewMode(int newMode);
    // Asks for a size and a file, then exports.
    void exportLayoutInteractive();

protected Q_SLOTS:
    void refreshUVList();
    void blockRefreshEvents();
    void unblockRefreshEvents();
    void nodeRemoved(RkNode* node);
    void clearListeners();

protected:
    void customEvent(QEvent* event) override;
    void showEvent(QShowEvent* event) override;

private:
    struct Private;
    std::unique_ptr<Private> d;
};
