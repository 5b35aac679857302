#include "rksymmetry.h"

#include "properties/rkfloatproperty.h"
#include "scene/rkbone.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostackhold.h"

namespace
{

struct Side {
    const char* left;
    const char* right;
};

// "l"/"r" only before a capital letter, so "leg" or "rib" are not taken for a side.
constexpr Side kSides[] = {{"Left", "Right"}, {"left", "right"}, {"l", "r"}};

bool takesSidePrefix(const QString& name, const QString& prefix)
{
    if (!name.startsWith(prefix) || name.size() == prefix.size())
        return false;
    return prefix.size() > 1 || name.at(prefix.size()).isUpper();
}

} // namespace

QString RkSymmetry::partnerName(const QString& name, bool* isLeft)
{
    for (const Side& side : kSides) {
        const QString left = QString::fromLatin1(side.left);
        const QString right = QString::fromLatin1(side.right);
        for (bool fromLeft : {true, false}) {
            const QString& from = fromLeft ? left : right;
            if (takesSidePrefix(name, from)) {
                if (isLeft)
                    *isLeft = fromLeft;
                return (fromLeft ? right : left) + name.mid(from.size());
            }
        }
    }
    return QString();
}

QList<RkSymmetry::Pair> RkSymmetry::pairs(const RkSkeleton* figure)
{
    QList<Pair> result;
    if (!figure)
        return result;
    QList<RkBone*> bones;
    figure->getAllBones(bones);
    for (RkBone* bone : bones) {
        bool isLeft = false;
        const QString partner = partnerName(bone->getName(), &isLeft);
        if (partner.isEmpty() || !isLeft)
            continue;
        if (RkBone* right = figure->findBone(partner))
            result.append(Pair{bone, right});
    }
    return result;
}

bool RkSymmetry::mirror(RkSkeleton* figure, Direction direction, const QString& caption)
{
    RkUndoStackHold hold;
    bool changed = false;
    for (const Pair& pair : pairs(figure)) {
        const bool leftToRight = direction == Direction::LeftToRight;
        const RkNode* from = leftToRight ? pair.left : pair.right;
        RkNode* to = leftToRight ? pair.right : pair.left;
        const struct {
            RkFloatProperty* (RkNode::*property)() const;
            float sign;
        } channels[] = {
            {&RkNode::getXRotate, 1},     {&RkNode::getYRotate, -1},   {&RkNode::getZRotate, -1},
            {&RkNode::getXTranslate, -1}, {&RkNode::getYTranslate, 1}, {&RkNode::getZTranslate, 1},
            {&RkNode::getScale, 1},
        };
        for (const auto& channel : channels) {
            RkFloatProperty* source = (from->*channel.property)();
            RkFloatProperty* target = (to->*channel.property)();
            if (!source || !target)
                continue;
            const float before = target->getValue();
            target->adjustValue(channel.sign * source->getValue());
            changed = changed || target->getValue() != before;
        }
    }
    if (changed)
        hold.accept(caption);
    return changed;
}
