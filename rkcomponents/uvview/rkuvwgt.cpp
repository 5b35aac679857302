#include "rkuvwgt.h"

#include "geometry/rkgeometry.h"
#include "rkuvrenderer.h"
#include "rkuvset.h"
#include "scene/rkmaterial.h"
#include "scene/rkobject.h"
#include "scene/rkshape.h"

#include <QMouseEvent>
#include <QWheelEvent>

#include <cmath>

namespace
{

constexpr float InitialZoom = 0.9f;
constexpr float MinZoom = 0.05f;
constexpr float MaxZoom = 2000.0f;

RkGeometry* geometryOf(const RkNode* node)
{
    RkObject* object = node ? node->getObject() : nullptr;
    return object ? object->getGeometry() : nullptr;
}

} // namespace

struct RkUVWgt::Private {
    QList<RkUVSet*> sets;
    SelectionMode selectionMode = SelectPoints;
    float centreU = 0.5f;
    float centreV = 0.5f;
    float zoom = InitialZoom;
    bool panning = false;
    QPointF panFrom;
};

RkUVWgt::RkUVWgt(QWidget* parent) : QGLWidget(parent), d(std::make_unique<Private>())
{
    setObjectName(QStringLiteral("UVWidget"));
    setMouseTracking(true);
    setMinimumSize(64, 64);
}

RkUVWgt::~RkUVWgt()
{
    clearSets();
}

const QList<RkUVSet*>& RkUVWgt::getUVSets() const
{
    return d->sets;
}

RkUVWgt::SelectionMode RkUVWgt::getSelectionMode() const
{
    return d->selectionMode;
}

float RkUVWgt::getZoom() const
{
    return d->zoom;
}

QPointF RkUVWgt::getCentre() const
{
    return QPointF(d->centreU, d->centreV);
}

QPointF RkUVWgt::uvAt(const QPointF& pos) const
{
    const auto b = RkUVRenderer::bounds(width(), height(), d->centreU, d->centreV, d->zoom);
    const double u = b.left + (b.right - b.left) * pos.x() / qMax(width(), 1);
    const double v = b.top - (b.top - b.bottom) * pos.y() / qMax(height(), 1);
    return QPointF(u, v);
}

void RkUVWgt::clearSets()
{
    qDeleteAll(d->sets);
    d->sets.clear();
}

void RkUVWgt::setUV(RkNode* node)
{
    if (RkGeometry* geometry = geometryOf(node))
        setUV(new RkUVSet(geometry));
}

void RkUVWgt::setUV(RkUVSet* uvSet)
{
    clearSets();
    if (!uvSet)
        return;
    d->sets.append(uvSet);
    updateGL();
}

void RkUVWgt::setUV(RkMaterial* material)
{
    clearSets();
    if (!material)
        return;
    addMaterialSets(material);
    updateGL();
}

void RkUVWgt::setUVList(RkNodeList& list)
{
    clearSets();
    for (RkNode* node : list) {
        if (RkGeometry* geometry = geometryOf(node))
            d->sets.append(new RkUVSet(geometry));
    }
    updateGL();
}

void RkUVWgt::setUVList(QList<RkUVSet*>& uvList)
{
    clearSets();
    d->sets = uvList;
    updateGL();
}

void RkUVWgt::setUVList(QList<RkMaterial*>& matList)
{
    clearSets();
    for (RkMaterial* material : matList) {
        if (material)
            addMaterialSets(material);
    }
    updateGL();
}

void RkUVWgt::addMaterialSets(RkMaterial* material)
{
    // One record per shape using the material, showing only that material's facets.
    QListIterator<RkShape*> it = material->shapeListIterator();
    while (it.hasNext()) {
        RkShape* shape = it.next();
        auto* object = qobject_cast<RkObject*>(shape->getElementParent());
        const int index = shape->findMaterialIndex(material);
        RkGeometry* geometry = object ? object->getGeometry() : nullptr;
        if (index == -1 || !geometry)
            continue;
        auto* set = new RkUVSet(geometry);
        set->clearMaterials();
        set->setMaterialVisible(index, true);
        d->sets.append(set);
    }
}

void RkUVWgt::setSelectionMode(RkUVWgt::SelectionMode mode)
{
    if (mode == d->selectionMode)
        return;
    d->selectionMode = mode;
    Q_EMIT selectionModeChanged(mode);
}

void RkUVWgt::doWeld()
{
    for (RkUVSet* set : qAsConst(d->sets))
        set->weld();
    updateGL();
}

void RkUVWgt::doUnweld()
{
    for (RkUVSet* set : qAsConst(d->sets))
        set->unweld();
    updateGL();
}

void RkUVWgt::frame()
{
    d->centreU = 0.5f;
    d->centreV = 0.5f;
    d->zoom = InitialZoom;
    updateGL();
}

void RkUVWgt::initializeGL()
{
    RkUVRenderer::initialize();
}

void RkUVWgt::resizeGL(int w, int h)
{
    glViewport(0, 0, w, h);
}

void RkUVWgt::paintGL()
{
    RkUVRenderer::paint(d->sets, width(), height(), d->centreU, d->centreV, d->zoom);
}

void RkUVWgt::wheelEvent(QWheelEvent* event)
{
    const double steps = event->angleDelta().y() / 120.0;
    if (steps == 0.0)
        return;
    // The UV point under the pointer stays under it.
    const QPointF pos = event->position();
    const QPointF before = uvAt(pos);
    d->zoom = qBound(MinZoom, float(d->zoom * std::pow(1.25, steps)), MaxZoom);
    const QPointF after = uvAt(pos);
    d->centreU += float(before.x() - after.x());
    d->centreV += float(before.y() - after.y());
    event->accept();
    updateGL();
}

void RkUVWgt::mousePressEvent(QMouseEvent* event)
{
    if (event->button() != Qt::MiddleButton) {
        QGLWidget::mousePressEvent(event);
        return;
    }
    d->panning = true;
    d->panFrom = event->localPos();
    event->accept();
}

void RkUVWgt::mouseMoveEvent(QMouseEvent* event)
{
    if (!d->panning) {
        QGLWidget::mouseMoveEvent(event);
        return;
    }
    const QPointF from = uvAt(d->panFrom);
    const QPointF to = uvAt(event->localPos());
    d->centreU -= float(to.x() - from.x());
    d->centreV -= float(to.y() - from.y());
    d->panFrom = event->localPos();
    event->accept();
    updateGL();
}

void RkUVWgt::mouseReleaseEvent(QMouseEvent* event)
{
    if (event->button() == Qt::MiddleButton && d->panning) {
        d->panning = false;
        event->accept();
        return;
    }
    QGLWidget::mouseReleaseEvent(event);
}
