#include "scene/rknode.h"

#include "io/rkinfile.h"
#include "io/rkoutfile.h"
#include "properties/rkboolproperty.h"
#include "properties/rkfloatproperty.h"
#include "properties/rkintproperty.h"
#include "properties/rkpropertygroup.h"
#include "properties/rkpropertygrouptree.h"
#include "scene/rkelementdata.h"
#include "scene/rkobject.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"

#include <QPointer>

namespace
{

enum NodeSection : short {
    SectionInfo = 0x0101,
    SectionParent = 0x0102,
    SectionProperty = 0x0110,
    SectionDataItems = 0x0120,
};

RkFloatProperty* makeFloat(RkNode* node, const QString& name, const QString& path, float min,
                           float max, float value, float sensitivity)
{
    auto* p = new RkFloatProperty(name, name);
    p->setMinMax(min, max);
    p->setDefaultValue(value);
    p->setValue(value);
    p->setSensitivity(sensitivity);
    node->addProperty(p, path);
    return p;
}

// Property classes a scene file may define on its own.
RkProperty* makeStoredProperty(const QString& className, const QString& name)
{
    if (className == QLatin1String("RkFloatProperty"))
        return new RkFloatProperty(name, name);
    if (className == QLatin1String("RkIntProperty"))
        return new RkIntProperty(name, name);
    if (className == QLatin1String("RkBoolProperty"))
        return new RkBoolProperty(name, name);
    return nullptr;
}

} // namespace

struct RkNode::Private {
    QPointer<RkNode> parent;
    QList<RkNode*> children;
    bool selected = false;
    QVector3D origin;
    QString source;
    QPointer<RkFloatProperty> xTrans, yTrans, zTrans, xRot, yRot, zRot, scale;
    QPointer<RkBoolProperty> visible;
    std::unique_ptr<RkObject> object;
};

RkNode::RkNode(QObject* parent) : RkElement(parent), d(std::make_unique<Private>())
{
    const QString translation = QStringLiteral("Transforms/Translation");
    const QString rotation = QStringLiteral("Transforms/Rotation");
    d->xTrans = makeFloat(this, QStringLiteral("XTranslate"), translation, -1000, 1000, 0, 0.01f);
    d->yTrans = makeFloat(this, QStringLiteral("YTranslate"), translation, -1000, 1000, 0, 0.01f);
    d->zTrans = makeFloat(this, QStringLiteral("ZTranslate"), translation, -1000, 1000, 0, 0.01f);
    d->xRot = makeFloat(this, QStringLiteral("XRotate"), rotation, -180, 180, 0, 1.0f);
    d->yRot = makeFloat(this, QStringLiteral("YRotate"), rotation, -180, 180, 0, 1.0f);
    d->zRot = makeFloat(this, QStringLiteral("ZRotate"), rotation, -180, 180, 0, 1.0f);
    d->scale = makeFloat(this, QStringLiteral("Scale"), QStringLiteral("Transforms/Scale"), 0, 100,
                         1, 0.01f);
    d->scale->setDisplayAsPercent(true);
    d->xTrans->setLabel(QStringLiteral("X Translate"));
    d->yTrans->setLabel(QStringLiteral("Y Translate"));
    d->zTrans->setLabel(QStringLiteral("Z Translate"));
    d->xRot->setLabel(QStringLiteral("X Rotate"));
    d->yRot->setLabel(QStringLiteral("Y Rotate"));
    d->zRot->setLabel(QStringLiteral("Z Rotate"));
    for (RkFloatProperty* p :
         {d->xTrans, d->yTrans, d->zTrans, d->xRot, d->yRot, d->zRot, d->scale}) {
        connect(p, &RkProperty::currentValueChanged, this, &RkNode::emitTransformChanged);
    }
    d->visible = new RkBoolProperty(QStringLiteral("Visible"), QStringLiteral("Visible"));
    d->visible->setDefaultValue(true);
    d->visible->setValue(true);
    addProperty(d->visible, QStringLiteral("General"));
}

RkNode::~RkNode()
{
    // Children outlive their parent only as top-level nodes.
    const auto children = d->children;
    for (RkNode* child : children)
        child->setNodeParent(nullptr);
    if (d->parent) {
        d->parent->d->children.removeAll(this);
        Q_EMIT d->parent->nodeChildrenChanged();
    }
}

RkObject* RkNode::getObject() const
{
    return d->object.get();
}

void RkNode::setObject(RkObject* object)
{
    if (object == d->object.get())
        return;
    d->object.reset(object);
    if (object)
        object->setElementParent(this);
    Q_EMIT uvsChanged();
}

RkSkeleton* RkNode::getSkeleton() const
{
    return nullptr;
}

RkNode* RkNode::getNodeParent() const
{
    return d->parent;
}

bool RkNode::setNodeParent(RkNode* parent)
{
    if (parent == d->parent)
        return true;
    for (RkNode* up = parent; up; up = up->getNodeParent()) {
        if (up == this)
            return false;
    }
    linkParent(parent);
    emitTransformChanged();
    return true;
}

void RkNode::linkParent(RkNode* parent)
{
    if (d->parent) {
        d->parent->d->children.removeAll(this);
        Q_EMIT d->parent->nodeChildrenChanged();
    }
    d->parent = parent;
    setElementParent(parent);
    if (parent) {
        parent->d->children.append(this);
        Q_EMIT parent->nodeChildrenChanged();
    }
}

QList<RkNode*> RkNode::getNodeChildren() const
{
    return d->children;
}

bool RkNode::isSelected() const
{
    return d->selected;
}

void RkNode::setSelectedFlag(bool on)
{
    d->selected = on;
}

QVector3D RkNode::getOrigin() const
{
    return d->origin;
}

void RkNode::setOrigin(const QVector3D& origin)
{
    if (origin == d->origin)
        return;
    d->origin = origin;
    emitTransformChanged();
}

static float valueOf(const QPointer<RkFloatProperty>& p, float fallback)
{
    return p ? p->getValue() : fallback;
}

QMatrix4x4 RkNode::getLocalTransform() const
{
    QMatrix4x4 m;
    m.translate(d->origin);
    m.translate(valueOf(d->xTrans, 0), valueOf(d->yTrans, 0), valueOf(d->zTrans, 0));
    m.rotate(valueOf(d->zRot, 0), 0, 0, 1);
    m.rotate(valueOf(d->yRot, 0), 0, 1, 0);
    m.rotate(valueOf(d->xRot, 0), 1, 0, 0);
    const float s = valueOf(d->scale, 1);
    m.scale(s);
    m.translate(-d->origin);
    return m;
}

QMatrix4x4 RkNode::getWorldTransform() const
{
    QMatrix4x4 m = getLocalTransform();
    for (RkNode* up = d->parent; up; up = up->getNodeParent())
        m = up->getLocalTransform() * m;
    return m;
}

bool RkNode::isVisible() const
{
    return !d->visible || d->visible->getValue();
}

RkFloatProperty* RkNode::getXTranslate() const
{
    return d->xTrans;
}
RkFloatProperty* RkNode::getYTranslate() const
{
    return d->yTrans;
}
RkFloatProperty* RkNode::getZTranslate() const
{
    return d->zTrans;
}
RkFloatProperty* RkNode::getXRotate() const
{
    return d->xRot;
}
RkFloatProperty* RkNode::getYRotate() const
{
    return d->yRot;
}
RkFloatProperty* RkNode::getZRotate() const
{
    return d->zRot;
}
RkFloatProperty* RkNode::getScale() const
{
    return d->scale;
}
RkBoolProperty* RkNode::getVisible() const
{
    return d->visible;
}

QString RkNode::getSource() const
{
    return d->source;
}

void RkNode::setSource(const QString& source)
{
    d->source = source;
}

void RkNode::emitTransformChanged()
{
    // Without recursion: a hierarchy may be deep.
    QList<RkNode*> pending{this};
    while (!pending.isEmpty()) {
        RkNode* node = pending.takeLast();
        Q_EMIT node->transformChanged();
        pending += node->d->children;
    }
}

void RkNode::save(RkOutFile* file) const
{
    file->startSection(SectionInfo);
    file->writeString(getLabel());
    file->writeString(RkScene::storedSource(d->source, file->fileName()));
    file->writeFloat(d->origin.x());
    file->writeFloat(d->origin.y());
    file->writeFloat(d->origin.z());
    file->endSection();

    file->writePointerSection(SectionParent, d->parent, 0);

    for (RkProperty* p : getProperties()) {
        file->startSection(SectionProperty);
        file->writeString(p->className());
        file->writeString(p->getName());
        file->writeString(p->getLabel());
        file->writeString(p->getPath());
        file->writeInt(p->getFlags());
        p->saveState(file);
        file->endSection();
    }

    file->startSection(SectionDataItems);
    short index = 0;
    for (RkElementData* item : getDataItems()) {
        if (item->isPersistent())
            file->writePointer(item, index++);
    }
    file->endSection();
}

void RkNode::loadSection(RkInFile* file, short sectionId)
{
    switch (sectionId) {
    case SectionInfo: {
        QString label, source;
        float x = 0, y = 0, z = 0;
        if (file->readString(label) && file->readString(source) && file->readFloat(x) &&
            file->readFloat(y) && file->readFloat(z)) {
            setLabel(label);
            d->source = source;
            d->origin = QVector3D(x, y, z);
        }
        return;
    }
    case SectionParent:
        file->readPointer();
        return;
    case SectionProperty: {
        QString cls, name, label, path;
        int flags = 0;
        if (!file->readString(cls) || !file->readString(name) || !file->readString(label) ||
            !file->readString(path) || !file->readInt(flags))
            return;
        if (name.isEmpty()) {
            file->setError(QStringLiteral("a property of node \"%1\" has no name").arg(getName()));
            return;
        }
        RkProperty* p = findProperty(name);
        if (p && p->className() != cls) {
            file->setError(QStringLiteral("property \"%1\" of node \"%2\" is a %3, the file "
                                          "holds a %4")
                               .arg(name, getName(), p->className(), cls));
            return;
        }
        if (!p) {
            p = makeStoredProperty(cls, name);
            if (!p) {
                file->setError(QStringLiteral("unknown property class \"%1\"").arg(cls));
                return;
            }
            addProperty(p, path);
        } else if (p->getPath() != path) {
            getPropertyGroups()->addProperty(p, path);
        }
        p->setLabel(label);
        p->setFlags(flags);
        p->loadState(file);
        return;
    }
    case SectionDataItems:
        while (file->readPointer() == 0) {
        }
        return;
    default:
        RkElement::loadSection(file, sectionId);
    }
}

void RkNode::setPointer(const RkInFile* file, short sectionId, short index, RkBase* object)
{
    if (sectionId == SectionParent) {
        if (!object)
            return;
        auto* parent = qobject_cast<RkNode*>(object);
        if (!parent)
            throw QStringLiteral("the parent of node \"%1\" is a %2, not a node")
                .arg(getName(), object->className());
        // Nothing watches a node being loaded, so it is linked without signals; a loop or a
        // hierarchy deeper than any rig fails the load.
        int levels = 0;
        for (RkNode* up = parent; up; up = up->getNodeParent()) {
            if (up == this)
                throw QStringLiteral("node \"%1\" would be its own parent").arg(getName());
            if (++levels >= MaxHierarchyDepth)
                throw QStringLiteral("the node hierarchy is deeper than %1 levels")
                    .arg(MaxHierarchyDepth);
        }
        linkParent(parent);
        return;
    }
    if (sectionId == SectionDataItems) {
        if (!object)
            return;
        auto* item = qobject_cast<RkElementData*>(object);
        if (!item)
            throw QStringLiteral("a data item of node \"%1\" is a %2, not element data")
                .arg(getName(), object->className());
        if (findDataItem(item->getName()))
            throw QStringLiteral("node \"%1\" holds two data items named \"%2\"")
                .arg(getName(), item->getName());
        addDataItem(item);
        return;
    }
    RkElement::setPointer(file, sectionId, index, object);
}
