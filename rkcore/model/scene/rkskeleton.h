#pragma once

#include "scene/rknode.h"

class RkBone;

// A figure: the root of a bone hierarchy.
class RKCORE_EXPORT RkSkeleton : public RkNode
{
    Q_OBJECT
public:
    explicit RkSkeleton(QObject* parent = nullptr);
    ~RkSkeleton() override;

    RkSkeleton* getSkeleton() const override;
    // Appends every bone below the figure, depth first, parents before their children.
    void getAllBones(QList<RkBone*>& bones) const;
    RkBone* findBone(const QString& name) const;
};
