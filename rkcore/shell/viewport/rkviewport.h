#pragma once

#include "rkcoreglobal.h"

#include <QWidget>

#include <memory>

class Rk3DViewport;
class RkView;

// One viewport: shows its view widget (the 3D picture of the scene) or, for a while, another view
// in its place (RkView, for example a UV layout). The viewport owns both.
class RKCORE_EXPORT RkViewport : public QWidget
{
    Q_OBJECT
public:
    explicit RkViewport(QWidget* parent = nullptr);
    ~RkViewport() override;

    // Sets the widget that draws the scene; the previous one is deleted.
    void setViewWidget(QWidget* widget);
    QWidget* getViewWidget() const;
    // The view widget when it is the 3D picture of the scene, else null.
    Rk3DViewport* get3DViewport() const;

    // Shows the view in place of the view widget; the previous view is deleted. Null brings the
    // view widget back.
    void setView(RkView* view);
    RkView* getView() const;

Q_SIGNALS:
    void viewChanged(RkView* view);

private:
    struct Private;
    std::unique_ptr<Private> d;
};
