#pragma once

#include "scene/rknode.h"

#include <QGLWidget>

#include <memory>

class RkMaterial;
class RkUVSet;

// Draws UV records (RkUVSet) as wire frames about the unit square. The widget owns every record
// it holds: records handed in are deleted by the next change of the list or with the widget.
// The wheel zooms about the pointer and a middle drag pans; frame() goes back to the initial view,
// in which the unit square fills 90 % of the shorter side, centred.
class RkUVWgt : public QGLWidget
{
    Q_OBJECT
public:
    enum SelectionMode { SelectPoints = 0, SelectPolygons = 1 };
    Q_ENUM(SelectionMode)

    explicit RkUVWgt(QWidget* parent = nullptr);
    ~RkUVWgt() override;

    const QList<RkUVSet*>& getUVSets() const;
    SelectionMode getSelectionMode() const;

    float getZoom() const;
    QPointF getCentre() const;
    // The UV point under a widget position.
    QPointF uvAt(const QPointF& pos) const;

Q_SIGNALS:
    void selectionModeChanged(RkUVWgt::SelectionMode mode);

public Q_SLOTS:
    void setUV(RkNode* node);
    void setUV(RkUVSet* uvSet);
    void setUV(RkMaterial* material);
    void setUVList(RkNodeList& list);
    void setUVList(QList<RkUVSet*>& uvList);
    void setUVList(QList<RkMaterial*>& matList);
    void setSelectionMode(RkUVWgt::SelectionMode mode);
    void doWeld();
    void doUnweld();
    void frame();

protected:
    void initializeGL() override;
    void resizeGL(int w, int h) override;
    void paintGL() override;
    void wheelEvent(QWheelEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;

private:
    void clearSets();
    void addMaterialSets(RkMaterial* material);

    struct Private;
    std::unique_ptr<Private> d;
};
