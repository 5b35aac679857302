#pragma once

#include <QList>
#include <QString>

class RkNode;
class RkSkeleton;

// Mirrors a figure's pose between its left and right bones across the figure's YZ plane (left is
// +X). Bones pair by name: "lShldr" with "rShldr", "LeftHand" with "RightHand".
class RkSymmetry
{
public:
    enum class Direction { LeftToRight, RightToLeft };

    struct Pair {
        RkNode* left = nullptr;
        RkNode* right = nullptr;
    };

    // The name of the bone on the other side, or an empty string for a bone of the middle.
    static QString partnerName(const QString& name, bool* isLeft = nullptr);
    static QList<Pair> pairs(const RkSkeleton* figure);
    // Copies each source bone's pose to its partner, mirrored: X rotation kept, Y and Z rotation
    // and X translation negated. One undo entry under caption; false when nothing changed.
    static bool mirror(RkSkeleton* figure, Direction direction, const QString& caption);
};
