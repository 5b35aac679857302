#include "rkposeedit.h"

#include "properties/rkfloatproperty.h"
#include "properties/rkintproperty.h"
#include "properties/rkpropertydefinitioncommand.h"
#include "scene/rkbone.h"
#include "scene/rkobject.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostack.h"
#include "undo/rkundostackhold.h"

#include <cmath>
#include <functional>
#include <limits>

namespace
{

bool startsGroup(const QString& path, const QString& group)
{
    return path == group || path.startsWith(group + QLatin1Char('/'));
}

QList<RkNode*> figureNodes(RkSkeleton* figure, bool withFigure)
{
    QList<RkNode*> nodes;
    if (!figure)
        return nodes;
    if (withFigure)
        nodes.append(figure);
    QList<RkBone*> bones;
    figure->getAllBones(bones);
    for (RkBone* bone : bones)
        nodes.append(bone);
    return nodes;
}

// Sets a numeric property the way a user's edit does: locked ones refuse, clamped ones stay in
// their limits. True when the value changed.
bool setNumber(RkProperty* property, double value)
{
    if (auto* f = qobject_cast<RkFloatProperty*>(property)) {
        const float before = f->getValue();
        f->adjustValue(float(value));
        return f->getValue() != before;
    }
    if (auto* i = qobject_cast<RkIntProperty*>(property)) {
        const int before = i->getValue();
        i->adjustValue(int(std::lround(value)));
        return i->getValue() != before;
    }
    return false;
}

// Runs change on each property inside one hold, recording each definition that changed (value
// changes record themselves). True when anything changed.
bool editDefinitions(const QList<RkProperty*>& properties, const QString& caption,
                     const std::function<bool(RkProperty*)>& change)
{
    RkUndoStackHold hold;
    bool changed = false;
    for (RkProperty* property : properties) {
        auto command = std::make_unique<RkPropertyDefinitionCommand>(property, caption);
        const bool valueChanged = change(property);
        command->afterChange();
        if (!command->isNoChange()) {
            rkUndoStack->push(std::move(command));
            changed = true;
        }
        changed = changed || valueChanged;
    }
    if (changed)
        hold.accept(caption);
    return changed;
}

bool editValues(const QList<RkProperty*>& properties, const QString& caption,
                const std::function<double(RkProperty*)>& target)
{
    RkUndoStackHold hold;
    bool changed = false;
    for (RkProperty* property : properties) {
        if (setNumber(property, target(property)))
            changed = true;
    }
    if (changed)
        hold.accept(caption);
    return changed;
}

double memorizedValue(const RkProperty* property)
{
    if (auto* f = qobject_cast<const RkFloatProperty*>(property))
        return f->getMemorizedValue();
    if (auto* i = qobject_cast<const RkIntProperty*>(property))
        return i->getMemorizedValue();
    return 0;
}

} // namespace

RkSkeleton* RkPoseEdit::selectedFigure(const RkScene* scene)
{
    RkNode* primary = scene ? scene->getPrimarySelection() : nullptr;
    return primary ? primary->getSkeleton() : nullptr;
}

QList<RkNode*> RkPoseEdit::nodes(const RkScene* scene, Scope scope)
{
    switch (scope) {
    case Scope::Figure:
    case Scope::FigureMorphs:
        return figureNodes(selectedFigure(scene), true);
    case Scope::FigurePose:
        return figureNodes(selectedFigure(scene), false);
    case Scope::SelectedItems:
    case Scope::Transforms:
        break;
    }
    return scene ? scene->getSelectedNodes() : QList<RkNode*>();
}

QList<RkProperty*> RkPoseEdit::numericProperties(const RkScene* scene, Scope scope)
{
    QList<RkProperty*> result;
    for (RkNode* node : nodes(scene, scope)) {
        for (RkProperty* property : node->getProperties()) {
            if (!qobject_cast<RkNumericProperty*>(property))
                continue;
            const bool wanted = scope == Scope::FigurePose || scope == Scope::Transforms
                                    ? isTransform(property)
                                    : scope != Scope::FigureMorphs || isMorph(property);
            if (wanted)
                result.append(property);
        }
    }
    return result;
}

QList<RkProperty*> RkPoseEdit::lockTargets(const RkScene* scene, Scope scope)
{
    if (scope == Scope::FigureMorphs)
        return numericProperties(scene, scope);
    QList<RkProperty*> result;
    for (RkNode* node : nodes(scene, Scope::SelectedItems)) {
        for (RkProperty* property : node->getProperties()) {
            if (scope != Scope::Transforms || isTransform(property))
                result.append(property);
        }
    }
    return result;
}

bool RkPoseEdit::isTransform(const RkProperty* property)
{
    // Imported bones keep their turns and moves in a "Pose" group.
    return startsGroup(property->getPath(), QStringLiteral("Transforms")) ||
           startsGroup(property->getPath(), QStringLiteral("Pose"));
}

bool RkPoseEdit::isMorph(const RkProperty* property)
{
    return qobject_cast<const RkFloatProperty*>(property) &&
           startsGroup(property->getPath(), QStringLiteral("Morphs"));
}

bool RkPoseEdit::isScale(const RkProperty* property)
{
    return property->getName().contains(QLatin1String("Scale"), Qt::CaseInsensitive) ||
           property->getLabel().contains(QLatin1String("Scale"), Qt::CaseInsensitive);
}

bool RkPoseEdit::memorize(const QList<RkProperty*>& properties, const QString& caption)
{
    return editDefinitions(properties, caption, [](RkProperty* property) {
        if (auto* f = qobject_cast<RkFloatProperty*>(property))
            f->setMemorizedValue(f->getValue());
        else if (auto* i = qobject_cast<RkIntProperty*>(property))
            i->setMemorizedValue(i->getValue());
        return false;
    });
}

bool RkPoseEdit::restore(const QList<RkProperty*>& properties, const QString& caption)
{
    return editValues(properties, caption, memorizedValue);
}

bool RkPoseEdit::zero(const QList<RkProperty*>& properties, const QString& caption)
{
    return editValues(properties, caption,
                      [](RkProperty* property) { return isScale(property) ? 1.0 : 0.0; });
}

bool RkPoseEdit::setLimits(const QList<RkProperty*>& properties, bool on, const QString& caption)
{
    return editDefinitions(properties, caption, [on](RkProperty* property) {
        auto* numeric = qobject_cast<RkNumericProperty*>(property);
        if (!numeric)
            return false;
        numeric->setClamped(on);
        if (!on)
            return false;
        // Clamping is part of the definition, so a locked value is brought into its limits too.
        const QVariant before = property->getValueVariant();
        if (auto* f = qobject_cast<RkFloatProperty*>(property))
            f->setValueVariant(qBound(f->getMin(), f->getValue(), f->getMax()));
        else if (auto* i = qobject_cast<RkIntProperty*>(property))
            i->setValueVariant(qBound(i->getMin(), i->getValue(), i->getMax()));
        return property->getValueVariant() != before;
    });
}

bool RkPoseEdit::setLocked(const QList<RkProperty*>& properties, bool on, const QString& caption)
{
    return editDefinitions(properties, caption, [on](RkProperty* property) {
        property->setLocked(on);
        return false;
    });
}

bool RkPoseEdit::lowestPoint(const RkNode* node, float& height)
{
    bool found = false;
    float lowest = std::numeric_limits<float>::max();
    QList<const RkNode*> pending{node};
    QVector<RkVec3> vertices;
    while (!pending.isEmpty()) {
        const RkNode* current = pending.takeLast();
        if (RkObject* object = current->getObject()) {
            object->getDeformedVertices(vertices);
            for (const RkVec3& v : vertices) {
                lowest = std::min(lowest, v.y);
                found = true;
            }
        }
        for (RkNode* child : current->getNodeChildren())
            pending.append(child);
    }
    if (found)
        height = lowest;
    return found;
}

bool RkPoseEdit::moveToFloor(RkNode* node, const QString& caption)
{
    RkFloatProperty* yTranslate = node ? node->getYTranslate() : nullptr;
    float lowest = 0;
    if (!yTranslate || !lowestPoint(node, lowest) || lowest == 0)
        return false;
    // The translation moves the node in its parent's frame: one unit of it moves the world
    // height by the parent's Y axis' height.
    float rise = 1;
    if (RkNode* parent = node->getNodeParent())
        rise = parent->getWorldTransform()(1, 1);
    if (std::abs(rise) < 1e-6f)
        return false;
    return editValues({yTranslate}, caption, [&](RkProperty*) {
        return double(yTranslate->getValue()) - double(lowest) / double(rise);
    });
}
