#include "scene/rkbone.h"

#include "scene/rkskeleton.h"

RkBone::RkBone(QObject* parent) : RkNode(parent) {}

RkBone::~RkBone() = default;

RkSkeleton* RkBone::getSkeleton() const
{
    for (RkNode* up = getNodeParent(); up; up = up->getNodeParent()) {
        if (auto* skeleton = qobject_cast<RkSkeleton*>(up))
            return skeleton;
    }
    return nullptr;
}
