#pragma once

#include "rkcoreglobal.h"

#include <QColor>
#include <QObject>
#include <QRect>
#include <QSize>

#include <memory>

class RkRenderData;

// Receives a render: the renderer asks it for the size, start time, back colour, crop window and
// frame count, then calls renderStarting(), frameStarting(frame), renderStep(),
// takeFrameData(data) for every frame and renderFinished() at the end.
class RKCORE_EXPORT RkRenderHandler : public QObject
{
    Q_OBJECT
public:
    RkRenderHandler(const QSize& size, int startTime, QObject* parent = nullptr);
    ~RkRenderHandler() override;

    virtual QSize getSize() const;
    virtual void setSize(const QSize& size);
    virtual int getStartTime() const;
    virtual QColor getBackColor() const;
    virtual void setBackColor(const QColor& colour);
    // An empty crop window (the default) renders the whole frame.
    virtual QRect getCropWindow() const;
    // At least 1.
    virtual int getNumFrames() const;
    virtual void setNumFrames(int frames);

public Q_SLOTS:
    virtual void setCropWindow(const QRect& window);
    virtual void renderStarting();
    virtual void renderStep();
    virtual void frameStarting(int frame);
    virtual void renderFinished();
    virtual bool takeFrameData(const RkRenderData* data);

private:
    struct Private;
    std::unique_ptr<Private> d;
};
