#pragma once

#include "scene/rkelement.h"

#include <QList>
#include <QMatrix4x4>
#include <QVector3D>

class RkFloatProperty;
class RkBoolProperty;
class RkObject;
class RkSkeleton;

// A node of the scene. Every node has a place in the node hierarchy and the transform
// properties "XTranslate", "YTranslate", "ZTranslate" (group "Transforms/Translation"),
// "XRotate", "YRotate", "ZRotate" in degrees (group "Transforms/Rotation"), "Scale" (group
// "Transforms/Scale") and "Visible" (group "General").
class RKCORE_EXPORT RkNode : public RkElement
{
    Q_OBJECT
public:
    explicit RkNode(QObject* parent = nullptr);
    ~RkNode() override;

    // The figure this node belongs to: the skeleton itself, a bone's skeleton, else null.
    virtual RkSkeleton* getSkeleton() const;

    RkNode* getNodeParent() const;
    // Moves the node under a new parent (null: top level). A parent that would make a loop is
    // refused.
    bool setNodeParent(RkNode* parent);
    // A scene file with a deeper node hierarchy is refused.
    static constexpr int MaxHierarchyDepth = 512;
    QList<RkNode*> getNodeChildren() const;

    bool isSelected() const;

    // The point the node turns and scales about, in the coordinates of the unposed scene.
    QVector3D getOrigin() const;
    void setOrigin(const QVector3D& origin);
    // Rotation order: Z, then Y, then X (a vector is turned about X first).
    QMatrix4x4 getLocalTransform() const;
    // Parent transforms applied after the local one.
    QMatrix4x4 getWorldTransform() const;
    bool isVisible() const;

    RkFloatProperty* getXTranslate() const;
    RkFloatProperty* getYTranslate() const;
    RkFloatProperty* getZTranslate() const;
    RkFloatProperty* getXRotate() const;
    RkFloatProperty* getYRotate() const;
    RkFloatProperty* getZRotate() const;
    RkFloatProperty* getScale() const;
    RkBoolProperty* getVisible() const;

    // The node's geometry and materials, or null. The node owns its object.
    RkObject* getObject() const;
    // Replaces the object (the old one is deleted) and emits uvsChanged().
    void setObject(RkObject* object);

    // Names the content the node is built from (a key such as "demo:figure"); a scene file stores
    // the key, and the loader asks the builder registered for it (RkScene::registerSourceBuilder)
    // to rebuild what the file does not hold, such as geometry.
    QString getSource() const;
    void setSource(const QString& source);

    void save(RkOutFile* file) const override;
    void loadSection(RkInFile* file, short sectionId) override;
    void setPointer(const RkInFile* file, short sectionId, short index, RkBase* object) override;

Q_SIGNALS:
    void uvsChanged();
    // The node's transform or that of a parent changed.
    void transformChanged();
    void nodeChildrenChanged();

private:
    friend class RkScene;
    void setSelectedFlag(bool on);
    void emitTransformChanged();
    void linkParent(RkNode* parent);

    struct Private;
    std::unique_ptr<Private> d;
};

using RkNodeList = QList<RkNode*>;
using RkNodeListIterator = QListIterator<RkNode*>;
