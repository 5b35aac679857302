#pragma once

#include "rkcoreglobal.h"

#include <QIcon>
#include <QWidget>

class RkViewToolBar;

// A view that a viewport shows in place of its 3D picture (RkViewport::setView). It has a tool bar
// that the view fills in buildToolBar() and lays out itself.
class RKCORE_EXPORT RkView : public QWidget
{
    Q_OBJECT
public:
    explicit RkView(const QString& name, QWidget* parent = nullptr);
    ~RkView() override;

    RkViewToolBar* getToolBar() const;

    virtual QString getLabel() const;
    virtual QIcon getIcon() const;
    virtual void buildToolBar();

private:
    RkViewToolBar* m_toolBar;
};
