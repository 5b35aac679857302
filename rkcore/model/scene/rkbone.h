#pragma once

#include "scene/rknode.h"

// A bone of a figure; its figure is the nearest skeleton above it.
class RKCORE_EXPORT RkBone : public RkNode
{
    Q_OBJECT
public:
    explicit RkBone(QObject* parent = nullptr);
    ~RkBone() override;

    RkSkeleton* getSkeleton() const override;
};
