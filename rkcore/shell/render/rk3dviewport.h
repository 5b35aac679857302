#pragma once

#include "render/rkscenerenderer.h"
#include "rkcoreglobal.h"

#include <QGLWidget>

#include <memory>

class RkFloatProperty;
class RkNode;
class RkRenderHandler;

// The 3D picture of the scene: every visible node with an object, shaded, with its morphs and
// pose applied; selected nodes are outlined. Left drag orbits, middle drag (or Alt + left drag)
// pans, right drag and the wheel zoom; a click selects the node under the pointer (Ctrl or Shift
// adds to the selection, a click on nothing clears it); F frames the selection.
//
// The camera is an orbit around a target, held in float properties ("CameraYaw",
// "CameraPitch", "CameraDistance", "CameraTargetX/Y/Z") so that an undo hold gathers its changes
// like any other: a cancelled hold puts a framing back.
class RKCORE_EXPORT Rk3DViewport : public QGLWidget
{
    Q_OBJECT
public:
    explicit Rk3DViewport(QWidget* parent = nullptr);
    ~Rk3DViewport() override;

    QColor getBackground() const;
    void setBackground(const QColor& colour);

    RkSceneRenderer::Camera getCamera() const;
    void setCamera(const RkSceneRenderer::Camera& camera);
    QList<RkFloatProperty*> getCameraProperties() const;

    // Points the camera at the selected nodes (a figure counts with its bones), or at the whole
    // scene when nothing with geometry is selected, close enough to fill the picture. The turn
    // of the camera is kept. Nothing changes when the scene shows nothing.
    void frameCamera();

    // The node whose surface is under the widget pixel, or null.
    RkNode* nodeAt(const QPoint& pos);

    // Offscreen rendering: true when this viewport can render into an offscreen buffer.
    virtual bool canHardwareRender() const;
    // Renders the scene synchronously at the handler's size with the current camera, calling
    // renderStarting(), then per frame frameStarting(frame), renderStep() and
    // takeFrameData(data), and renderFinished() last. False (and no call) when the size is
    // empty or larger than the buffer allows, or offscreen rendering is not available.
    virtual bool hardwareRender(RkRenderHandler* handler);

Q_SIGNALS:
    // A frame drawn by paintGL() was handed to the display: emitted after the buffer swap (or
    // the flush of a single-buffered context). Not emitted for offscreen renders, nor for a draw
    // with autoBufferSwap() off, nor when the context could not draw.
    void framePresented();

protected:
    void glDraw() override;
    void initializeGL() override;
    void resizeGL(int w, int h) override;
    void paintGL() override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void wheelEvent(QWheelEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;

private:
    void scheduleRewire();
    void rewire();

    struct Private;
    std::unique_ptr<Private> d;
};
