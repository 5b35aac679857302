#pragma once

#include "scene/rkelement.h"

#include <QColor>
#include <QImage>
#include <QListIterator>

#include <memory>

class RkShape;

// A surface material. Every material alive is listed, in creation order, by the static
// getNumMaterials()/getMaterial(); the shapes that use it are listed by shapeListIterator().
// Materials are selected apart from nodes; the scene emits materialSelectionChanged() once for
// each change of that selection.
class RKCORE_EXPORT RkMaterial : public RkElement
{
    Q_OBJECT
public:
    explicit RkMaterial(const QString& name, QObject* parent = nullptr);
    ~RkMaterial() override;

    static int getNumMaterials();
    // Null for an index out of range.
    static RkMaterial* getMaterial(int index);
    static QList<RkMaterial*> getSelectedMaterials();
    static void clearMaterialSelection();

    bool isSelected() const;
    void setSelected(bool selected);

    QColor getDiffuseColor() const;
    void setDiffuseColor(const QColor& colour);

    // The picture mapped over the surface by its UVs, tinted by the diffuse colour; a null
    // image for none. name says where it came from (a file name) and is only shown.
    QImage getDiffuseTexture() const;
    QString getDiffuseTextureName() const;
    void setDiffuseTexture(const QImage& image, const QString& name = QString());

    // The shapes that use the material, in the order they took it up.
    QListIterator<RkShape*> shapeListIterator() const;
    QList<RkShape*> getShapes() const;

Q_SIGNALS:
    void uvsChanged();
    void diffuseColorChanged();

private:
    friend class RkShape;
    void addShape(RkShape* shape);
    void removeShape(RkShape* shape);

    struct Private;
    std::unique_ptr<Private> d;
};
