#pragma once

#include "render/rkimagerenderhandler.h"

#include <memory>

class Rk3DViewport;
class RkEzPropertiesControl;

// Renders one tile's thumbnail: for the render the viewport's camera is framed and the tile's
// morph dialled to full strength, all inside an undo hold that is cancelled afterwards, so the
// camera and the undo stack end exactly as they were. A hover preview running on another tile of
// the same grid is stopped for the render and started again after it.
class RkEzImageRenderHandler : public RkImageRenderHandler
{
    Q_OBJECT
public:
    RkEzImageRenderHandler(Rk3DViewport* viewport, RkEzPropertiesControl* tile, const QSize& size,
                           int startTime);
    // A render that never finished takes its changes back here.
    ~RkEzImageRenderHandler() override;

public Q_SLOTS:
    void renderStarting() override;
    void renderStep() override;
    void frameStarting(int frame) override;
    void renderFinished() override;
    bool takeFrameData(const RkRenderData* data) override;

private:
    struct Private;
    std::unique_ptr<Private> d;
};
