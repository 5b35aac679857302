#include "viewport/rkviewport.h"

#include "render/rk3dviewport.h"
#include "viewport/rkview.h"

#include <QPointer>
#include <QStackedLayout>

struct RkViewport::Private {
    QStackedLayout* stack = nullptr;
    QPointer<QWidget> viewWidget;
    QPointer<RkView> view;
};

RkViewport::RkViewport(QWidget* parent) : QWidget(parent), d(std::make_unique<Private>())
{
    setObjectName(QStringLiteral("MainViewport"));
    d->stack = new QStackedLayout(this);
    d->stack->setContentsMargins(0, 0, 0, 0);
    setMinimumSize(160, 120);
    setAutoFillBackground(true);
    setBackgroundRole(QPalette::Dark);
}

RkViewport::~RkViewport() = default;

void RkViewport::setViewWidget(QWidget* widget)
{
    if (widget == d->viewWidget)
        return;
    delete d->viewWidget.data();
    d->viewWidget = widget;
    if (!widget)
        return;
    d->stack->insertWidget(0, widget);
    if (!d->view)
        d->stack->setCurrentWidget(widget);
}

QWidget* RkViewport::getViewWidget() const
{
    return d->viewWidget;
}

Rk3DViewport* RkViewport::get3DViewport() const
{
    return qobject_cast<Rk3DViewport*>(d->viewWidget.data());
}

void RkViewport::setView(RkView* view)
{
    if (view == d->view)
        return;
    if (d->view) {
        // The old view may be the sender of the event that replaces it.
        d->stack->removeWidget(d->view);
        d->view->hide();
        d->view->deleteLater();
    }
    d->view = view;
    if (view) {
        d->stack->addWidget(view);
        d->stack->setCurrentWidget(view);
    } else if (d->viewWidget) {
        d->stack->setCurrentWidget(d->viewWidget);
    }
    Q_EMIT viewChanged(view);
}

RkView* RkViewport::getView() const
{
    return d->view;
}
