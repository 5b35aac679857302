#include "scene/rkskeleton.h"

#include "scene/rkbone.h"

RkSkeleton::RkSkeleton(QObject* parent) : RkNode(parent) {}

RkSkeleton::~RkSkeleton() = default;

RkSkeleton* RkSkeleton::getSkeleton() const
{
    return const_cast<RkSkeleton*>(this);
}

static void collectBones(const RkNode* node, QList<RkBone*>& bones)
{
    for (RkNode* child : node->getNodeChildren()) {
        // A figure parented under another keeps its own bones.
        if (qobject_cast<RkSkeleton*>(child))
            continue;
        if (auto* bone = qobject_cast<RkBone*>(child))
            bones.append(bone);
        collectBones(child, bones);
    }
}

void RkSkeleton::getAllBones(QList<RkBone*>& bones) const
{
    collectBones(this, bones);
}

RkBone* RkSkeleton::findBone(const QString& name) const
{
    QList<RkBone*> bones;
    getAllBones(bones);
    for (RkBone* bone : bones) {
        if (bone->getName() == name)
            return bone;
    }
    return nullptr;
}
