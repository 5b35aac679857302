#include "render/rk3dviewport.h"

#include "geometry/rkgeometry.h"
#include "properties/rkfloatproperty.h"
#include "render/rkrenderdata.h"
#include "render/rkrenderhandler.h"
#include "scene/rkmaterial.h"
#include "scene/rknode.h"
#include "scene/rkobject.h"
#include "scene/rkscene.h"
#include "scene/rkshape.h"
#include "scene/rkskeleton.h"

#include <QGLFramebufferObject>
#include <QMouseEvent>
#include <QPointer>
#include <QWheelEvent>

#include <algorithm>
#include <cmath>

namespace
{

const int kMaxRenderSize = 8192;
// A press that moves less than this (in pixels) before release is a click.
const int kClickSlop = 4;

struct CameraProperty {
    const char* name;
    const char* label;
    float min, max, value;
};

const CameraProperty kCameraProperties[] = {
    {"CameraYaw", "Camera Yaw", -100000, 100000, 15},
    {"CameraPitch", "Camera Pitch", -89, 89, 8},
    {"CameraDistance", "Camera Distance", 0.05f, 10000, 4.2f},
    {"CameraTargetX", "Camera Target X", -100000, 100000, 0},
    {"CameraTargetY", "Camera Target Y", -100000, 100000, 0.95f},
    {"CameraTargetZ", "Camera Target Z", -100000, 100000, 0},
};
enum { Yaw, Pitch, Distance, TargetX, TargetY, TargetZ, NumCameraProperties };

} // namespace

struct Rk3DViewport::Private {
    QColor background = QColor(92, 98, 112);
    RkFloatProperty* camera[NumCameraProperties] = {};
    RkSceneRenderer renderer;
    std::unique_ptr<QGLFramebufferObject> fbo;

    // What the last gathering found, item by item.
    QVector<QPointer<RkNode>> itemNodes;
    QVector<QVector<RkVec3>> positions;

    QList<QMetaObject::Connection> watches;
    bool rewirePending = false;

    // Aspect of the picture being framed: the widget's, or the offscreen render's during one.
    float renderAspect = 0.0f;

    // Set by paintGL(): tells glDraw() that the base class really drew.
    bool painted = false;

    Qt::MouseButton dragButton = Qt::NoButton;
    QPoint pressPos;
    QPoint lastPos;
    bool dragged = false;

    void gather(QVector<RkSceneRenderer::Item>& items, bool highlight);
};

void Rk3DViewport::Private::gather(QVector<RkSceneRenderer::Item>& items, bool highlight)
{
    items.clear();
    itemNodes.clear();
    if (!rkScene)
        return;
    const RkNodeList nodes = rkScene->getNodes();
    positions.resize(nodes.size());
    for (RkNode* node : nodes) {
        RkObject* object = node->getObject();
        if (!object || !object->getGeometry() || !node->isVisible())
            continue;
        RkSkeleton* figure = node->getSkeleton();
        if (figure && figure != node && !figure->isVisible())
            continue;
        const int slot = items.size();
        object->getDeformedVertices(positions[slot]);
        RkSceneRenderer::Item item;
        item.geometry = object->getGeometry();
        item.positions = &positions[slot];
        if (RkShape* shape = object->getShape(0)) {
            for (int m = 0; m < shape->getNumMaterials(); ++m) {
                const RkMaterial* material = shape->getMaterial(m);
                item.materialColours.append(material ? material->getDiffuseColor()
                                                     : QColor(180, 180, 180));
                item.materialTextures.append(material ? material->getDiffuseTexture() : QImage());
            }
        }
        item.highlighted = highlight && (node->isSelected() || (figure && figure->isSelected()));
        items.append(item);
        itemNodes.append(node);
    }
}

Rk3DViewport::Rk3DViewport(QWidget* parent) : QGLWidget(parent), d(std::make_unique<Private>())
{
    setObjectName(QStringLiteral("Rk3DViewport"));
    setFocusPolicy(Qt::StrongFocus);
    setMinimumSize(64, 64);
    for (int i = 0; i < NumCameraProperties; ++i) {
        const CameraProperty& def = kCameraProperties[i];
        auto* p = new RkFloatProperty(QLatin1String(def.name), QLatin1String(def.label), this);
        p->setMinMax(def.min, def.max);
        p->setDefaultValue(def.value);
        p->setValue(def.value);
        p->setHidden(true);
        connect(p, &RkProperty::currentValueChanged, this, [this] { update(); });
        d->camera[i] = p;
    }
    if (rkScene) {
        connect(rkScene, &RkScene::nodeAdded, this, &Rk3DViewport::scheduleRewire);
        connect(rkScene, &RkScene::nodeRemoved, this, &Rk3DViewport::scheduleRewire);
        connect(rkScene, &RkScene::sceneLoaded, this, &Rk3DViewport::scheduleRewire);
        connect(rkScene, &RkScene::sceneCleared, this, &Rk3DViewport::scheduleRewire);
        connect(rkScene, &RkScene::nodeSelectionListChanged, this, [this] { update(); });
    }
    rewire();
}

Rk3DViewport::~Rk3DViewport()
{
    // The offscreen buffer belongs to this widget's context.
    if (d->fbo) {
        makeCurrent();
        d->fbo.reset();
        doneCurrent();
    }
}

QColor Rk3DViewport::getBackground() const
{
    return d->background;
}

void Rk3DViewport::setBackground(const QColor& colour)
{
    if (!colour.isValid() || colour == d->background)
        return;
    d->background = colour;
    update();
}

RkSceneRenderer::Camera Rk3DViewport::getCamera() const
{
    RkSceneRenderer::Camera c;
    c.yaw = d->camera[Yaw]->getValue();
    c.pitch = d->camera[Pitch]->getValue();
    c.distance = d->camera[Distance]->getValue();
    c.target = RkVec3(d->camera[TargetX]->getValue(), d->camera[TargetY]->getValue(),
                      d->camera[TargetZ]->getValue());
    return c;
}

void Rk3DViewport::setCamera(const RkSceneRenderer::Camera& camera)
{
    // Keep the turn within one revolution so a long orbit does not run into the limits.
    float yaw = std::fmod(camera.yaw, 360.0f);
    if (yaw > 180.0f)
        yaw -= 360.0f;
    else if (yaw < -180.0f)
        yaw += 360.0f;
    d->camera[Yaw]->setValue(yaw);
    d->camera[Pitch]->adjustValue(qBound(-89.0f, camera.pitch, 89.0f));
    d->camera[Distance]->setValue(qBound(0.05f, camera.distance, 10000.0f));
    d->camera[TargetX]->setValue(camera.target.x);
    d->camera[TargetY]->setValue(camera.target.y);
    d->camera[TargetZ]->setValue(camera.target.z);
}

QList<RkFloatProperty*> Rk3DViewport::getCameraProperties() const
{
    return QList<RkFloatProperty*>(std::begin(d->camera), std::end(d->camera));
}

void Rk3DViewport::frameCamera()
{
    QVector<RkSceneRenderer::Item> items;
    d->gather(items, false);
    QVector<RkSceneRenderer::Item> chosen;
    if (rkScene && rkScene->getNumSelectedNodes() > 0) {
        for (int i = 0; i < items.size(); ++i) {
            const RkNode* node = d->itemNodes[i];
            const RkSkeleton* figure = node ? node->getSkeleton() : nullptr;
            if (node && (node->isSelected() || (figure && figure->isSelected())))
                chosen.append(items[i]);
        }
    }
    if (chosen.isEmpty())
        chosen = items;
    RkVec3 lo, hi;
    if (!RkSceneRenderer::bounds(chosen, lo, hi))
        return;

    // The nearest distance at which every corner of the bounds lies inside the narrower
    // opening of the picture, looking from the current direction at the centre of the bounds.
    RkSceneRenderer::Camera cam = getCamera();
    const RkVec3 centre = (lo + hi) * 0.5f;
    const float aspect = d->renderAspect > 0.0f
                             ? d->renderAspect
                             : float(std::max(width(), 1)) / float(std::max(height(), 1));
    const float tanY = std::tan(0.5f * cam.fovY * float(M_PI / 180.0));
    const float tanX = tanY * aspect;
    cam.target = centre;
    const RkVec3 forward = (cam.target - cam.eye()).normalized();
    const RkVec3 right = forward.cross(RkVec3(0, 1, 0)).normalized();
    const RkVec3 up = right.cross(forward).normalized();
    float distance = 0.01f;
    for (int corner = 0; corner < 8; ++corner) {
        const RkVec3 c =
            RkVec3(corner & 1 ? hi.x : lo.x, corner & 2 ? hi.y : lo.y, corner & 4 ? hi.z : lo.z) -
            centre;
        const float depth = c.dot(forward);
        distance = std::max(distance, std::fabs(c.dot(right)) / tanX - depth);
        distance = std::max(distance, std::fabs(c.dot(up)) / tanY - depth);
        distance = std::max(distance, 0.05f - depth);
    }
    cam.distance = distance * 1.05f;
    setCamera(cam);
}

RkNode* Rk3DViewport::nodeAt(const QPoint& pos)
{
    QVector<RkSceneRenderer::Item> items;
    d->gather(items, false);
    const int hit = RkSceneRenderer::pick(items, getCamera(), width(), height(), pos.x(), pos.y());
    return hit >= 0 ? d->itemNodes[hit].data() : nullptr;
}

bool Rk3DViewport::canHardwareRender() const
{
    return isValid() && QGLFramebufferObject::hasOpenGLFramebufferObjects();
}

bool Rk3DViewport::hardwareRender(RkRenderHandler* handler)
{
    if (!handler)
        return false;
    const QSize size = handler->getSize();
    if (size.isEmpty() || size.width() > kMaxRenderSize || size.height() > kMaxRenderSize)
        return false;
    makeCurrent();
    if (!canHardwareRender())
        return false;
    if (!d->fbo || d->fbo->size() != size) {
        d->fbo.reset();
        d->fbo = std::make_unique<QGLFramebufferObject>(size, QGLFramebufferObject::Depth);
        if (!d->fbo->isValid()) {
            d->fbo.reset();
            return false;
        }
    }

    d->renderAspect = float(size.width()) / float(size.height());
    handler->renderStarting();
    const int frames = std::max(1, handler->getNumFrames());
    for (int frame = 0; frame < frames; ++frame) {
        handler->frameStarting(frame);
        handler->renderStep();
        // The handler may have changed the scene or the camera; gather after it did.
        QVector<RkSceneRenderer::Item> items;
        d->gather(items, false);
        const QColor back =
            handler->getBackColor().isValid() ? handler->getBackColor() : d->background;
        makeCurrent();
        d->fbo->bind();
        d->renderer.draw(items, getCamera(), size.width(), size.height(), back);
        d->fbo->release();
        QImage pixels = d->fbo->toImage().convertToFormat(QImage::Format_ARGB32);
        QPoint offset;
        const QRect crop = handler->getCropWindow().intersected(pixels.rect());
        if (!handler->getCropWindow().isEmpty()) {
            pixels = pixels.copy(crop);
            offset = crop.topLeft();
        }
        const RkRenderData data(pixels, frame, offset);
        handler->takeFrameData(&data);
    }
    d->renderAspect = 0.0f;
    handler->renderFinished();
    update();
    return true;
}

void Rk3DViewport::glDraw()
{
    // The base class draws and swaps, or returns early while the context is unusable.
    d->painted = false;
    QGLWidget::glDraw();
    if (d->painted && (!doubleBuffer() || autoBufferSwap()))
        Q_EMIT framePresented();
}

void Rk3DViewport::initializeGL()
{
    glEnable(GL_DEPTH_TEST);
}

void Rk3DViewport::resizeGL(int w, int h)
{
    glViewport(0, 0, w, h);
}

void Rk3DViewport::paintGL()
{
    QVector<RkSceneRenderer::Item> items;
    d->gather(items, true);
    d->renderer.draw(items, getCamera(), width(), height(), d->background,
                     RkSceneRenderer::DrawGround | RkSceneRenderer::DrawHighlight);
    d->painted = true;
}

void Rk3DViewport::mousePressEvent(QMouseEvent* event)
{
    // A second button during a drag changes nothing; a drag whose release went elsewhere (a
    // popup took it) ends with the next press.
    if (d->dragButton != Qt::NoButton && event->buttons() != event->button())
        return;
    d->dragButton = event->button();
    if (d->dragButton == Qt::LeftButton && (event->modifiers() & Qt::AltModifier))
        d->dragButton = Qt::MiddleButton;
    d->pressPos = d->lastPos = event->pos();
    d->dragged = false;
    event->accept();
}

void Rk3DViewport::mouseMoveEvent(QMouseEvent* event)
{
    if (d->dragButton == Qt::NoButton)
        return;
    if ((event->pos() - d->pressPos).manhattanLength() >= kClickSlop)
        d->dragged = true;
    if (!d->dragged)
        return;
    const QPoint delta = event->pos() - d->lastPos;
    d->lastPos = event->pos();
    RkSceneRenderer::Camera cam = getCamera();
    switch (d->dragButton) {
    case Qt::LeftButton:
        cam.yaw -= delta.x() * 0.4f;
        cam.pitch += delta.y() * 0.4f;
        break;
    case Qt::MiddleButton: {
        // Move the target across the picture so the scene follows the pointer.
        const float d2r = float(M_PI / 180.0);
        const float perPixel =
            2.0f * cam.distance * std::tan(0.5f * cam.fovY * d2r) / std::max(height(), 1);
        const RkVec3 forward = (cam.target - cam.eye()).normalized();
        const RkVec3 right = forward.cross(RkVec3(0, 1, 0)).normalized();
        const RkVec3 up = right.cross(forward).normalized();
        cam.target += right * (-delta.x() * perPixel) + up * (delta.y() * perPixel);
        break;
    }
    case Qt::RightButton:
        cam.distance *= std::exp(delta.y() * 0.01f);
        break;
    default:
        return;
    }
    setCamera(cam);
}

void Rk3DViewport::mouseReleaseEvent(QMouseEvent* event)
{
    if (event->button() != d->dragButton &&
        !(d->dragButton == Qt::MiddleButton && event->button() == Qt::LeftButton))
        return;
    const bool click = !d->dragged && event->button() == Qt::LeftButton;
    d->dragButton = Qt::NoButton;
    if (!click || !rkScene)
        return;
    const bool add = event->modifiers() & (Qt::ControlModifier | Qt::ShiftModifier);
    if (RkNode* node = nodeAt(event->pos()))
        rkScene->selectNode(node, add);
    else if (!add)
        rkScene->clearSelection();
}

void Rk3DViewport::wheelEvent(QWheelEvent* event)
{
    RkSceneRenderer::Camera cam = getCamera();
    cam.distance *= std::pow(0.999f, float(event->angleDelta().y()));
    setCamera(cam);
    event->accept();
}

void Rk3DViewport::keyPressEvent(QKeyEvent* event)
{
    if (event->key() == Qt::Key_F && event->modifiers() == Qt::NoModifier) {
        frameCamera();
        return;
    }
    QGLWidget::keyPressEvent(event);
}

void Rk3DViewport::scheduleRewire()
{
    update();
    if (d->rewirePending)
        return;
    d->rewirePending = true;
    QMetaObject::invokeMethod(this, &Rk3DViewport::rewire, Qt::QueuedConnection);
}

void Rk3DViewport::rewire()
{
    // Any property of a node may move what is shown (morphs, pose, visibility): watch them all.
    d->rewirePending = false;
    for (const QMetaObject::Connection& c : d->watches)
        disconnect(c);
    d->watches.clear();
    if (!rkScene)
        return;
    const auto repaint = [this] { update(); };
    for (RkNode* node : rkScene->getNodes()) {
        d->watches << connect(node, &RkElement::propertyTreeChanged, this,
                              &Rk3DViewport::scheduleRewire);
        d->watches << connect(node, &RkNode::uvsChanged, this, repaint);
        for (RkProperty* p : node->getProperties())
            d->watches << connect(p, &RkProperty::currentValueChanged, this, repaint);
    }
    update();
}
