#pragma once

#include <QList>
#include <QString>

class RkNode;
class RkProperty;
class RkScene;
class RkSkeleton;

// The figure and selection commands of the host (Memorize, Restore, Zero, Limits, Lock, Move to
// Floor): which properties each one works on, and the edits. Every edit is one undo entry under
// the caption given, and leaves no entry when it changed nothing.
class RkPoseEdit
{
public:
    enum class Scope {
        Figure,        // the selected figure and its bones
        FigurePose,    // the bones of the selected figure
        FigureMorphs,  // the selected figure's morphs
        SelectedItems, // the selected nodes
        Transforms,    // the selected nodes' transforms
    };

    // The figure of the primary selection, or null.
    static RkSkeleton* selectedFigure(const RkScene* scene);
    // The nodes a scope reaches.
    static QList<RkNode*> nodes(const RkScene* scene, Scope scope);
    // The numeric properties a scope works on: all of them for the figure and the selected
    // items, the transforms for the pose and the transforms, the morphs for the morphs.
    static QList<RkProperty*> numericProperties(const RkScene* scene, Scope scope);
    // What Lock and Unlock work on: every property of the selected nodes, the figure's morphs,
    // or the selected nodes' transforms.
    static QList<RkProperty*> lockTargets(const RkScene* scene, Scope scope);

    static bool isTransform(const RkProperty* property);
    static bool isMorph(const RkProperty* property);
    // Scale properties are "zero" at 1.
    static bool isScale(const RkProperty* property);

    static bool memorize(const QList<RkProperty*>& properties, const QString& caption);
    static bool restore(const QList<RkProperty*>& properties, const QString& caption);
    static bool zero(const QList<RkProperty*>& properties, const QString& caption);
    // Limits on also brings values that are out of their limits back into them.
    static bool setLimits(const QList<RkProperty*>& properties, bool on, const QString& caption);
    static bool setLocked(const QList<RkProperty*>& properties, bool on, const QString& caption);

    // The lowest height of the deformed vertices of the node and the nodes below it; false when
    // they have none.
    static bool lowestPoint(const RkNode* node, float& height);
    // Puts that lowest point at height 0 through the node's Y translation.
    static bool moveToFloor(RkNode* node, const QString& caption);
};
