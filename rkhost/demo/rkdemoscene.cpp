#include "demo/rkdemoscene.h"

#include "demo/rkdemomesh.h"
#include "properties/rkboolproperty.h"
#include "properties/rkfloatproperty.h"
#include "properties/rkintproperty.h"
#include "scene/rkbone.h"
#include "scene/rkcamera.h"
#include "scene/rklight.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"

#include <QHash>

const char* const RkDemoFigureName = "Figure";
const char* const RkDemoPropName = "Prop";
const char* const RkDemoCameraName = "Camera";
const char* const RkDemoLightName = "Light";
const char* const RkDemoFigureSource = "demo:figure";
const char* const RkDemoPropSource = "demo:prop";

const QVector<RkDemoBone>& rkDemoBones()
{
    static const QVector<RkDemoBone> bones = [] {
        QVector<RkDemoBone> b = {
            {"hip", "Hip", "", {0.0f, 0.95f, 0.0f}},
            {"abdomen", "Abdomen", "hip", {0.0f, 1.05f, 0.0f}},
            {"chest", "Chest", "abdomen", {0.0f, 1.25f, 0.0f}},
            {"neck", "Neck", "chest", {0.0f, 1.48f, 0.0f}},
            {"head", "Head", "neck", {0.0f, 1.58f, 0.0f}},
        };
        // Arms and legs, left (+X) then right.
        for (int side = 0; side < 2; ++side) {
            const float s = side == 0 ? 1.0f : -1.0f;
            const QString p = side == 0 ? QStringLiteral("l") : QStringLiteral("r");
            const QString w = side == 0 ? QStringLiteral("Left ") : QStringLiteral("Right ");
            b.append({p + "Collar", w + "Collar", "chest", {s * 0.04f, 1.42f, 0.0f}});
            b.append({p + "Shldr", w + "Shoulder", p + "Collar", {s * 0.18f, 1.42f, 0.0f}});
            b.append({p + "ForeArm", w + "Forearm", p + "Shldr", {s * 0.45f, 1.42f, 0.0f}});
            b.append({p + "Hand", w + "Hand", p + "ForeArm", {s * 0.70f, 1.42f, 0.0f}});
        }
        for (int side = 0; side < 2; ++side) {
            const float s = side == 0 ? 1.0f : -1.0f;
            const QString p = side == 0 ? QStringLiteral("l") : QStringLiteral("r");
            const QString w = side == 0 ? QStringLiteral("Left ") : QStringLiteral("Right ");
            b.append({p + "Thigh", w + "Thigh", "hip", {s * 0.10f, 0.92f, 0.0f}});
            b.append({p + "Shin", w + "Shin", p + "Thigh", {s * 0.10f, 0.50f, 0.0f}});
            b.append({p + "Foot", w + "Foot", p + "Shin", {s * 0.10f, 0.08f, 0.0f}});
        }
        return b;
    }();
    return bones;
}

const QVector<RkDemoMorph>& rkDemoMorphs()
{
    static const QVector<RkDemoMorph> morphs = {
        {"Smile", "Smile", "Morphs/Head/Face", "face"},
        {"Frown", "Frown", "Morphs/Head/Face", "face"},
        {"BrowUp", "Brow Up", "Morphs/Head/Face", "face"},
        {"CheeksPuff", "Cheeks Puff", "Morphs/Head/Face", "face"},
        {"JawOpen", "Jaw Open", "Morphs/Head/Face", "face"},
        {"NoseLong", "Nose Long", "Morphs/Head/Face", "face"},
        {"EarsPointed", "Ears Pointed", "Morphs/Head/Ears", "ears"},
        {"EarsLarge", "Ears Large", "Morphs/Head/Ears", "ears"},
        {"EarsBack", "Ears Back", "Morphs/Head/Ears", "ears"},
        {"HeadRound", "Head Round", "Morphs/Head", "head"},
        {"HeadLong", "Head Long", "Morphs/Head", "head"},
        {"HeadWide", "Head Wide", "Morphs/Head", "head"},
        {"BodyHeavy", "Body Heavy", "Morphs/Body", "body"},
        {"BodyThin", "Body Thin", "Morphs/Body", "body"},
        {"Belly", "Belly", "Morphs/Body", "body"},
        {"ChestBroad", "Chest Broad", "Morphs/Body", "body"},
        {"ShouldersWide", "Shoulders Wide", "Morphs/Body", "body"},
        {"ArmsMuscular", "Arms Muscular", "Morphs/Body/Arms", "arms"},
        {"ArmsLong", "Arms Long", "Morphs/Body/Arms", "arms"},
        {"HandsLarge", "Hands Large", "Morphs/Body/Arms", "arms"},
        {"LegsLong", "Legs Long", "Morphs/Body/Legs", "legs"},
        {"ThighsHeavy", "Thighs Heavy", "Morphs/Body/Legs", "legs"},
        {"CalvesStrong", "Calves Strong", "Morphs/Body/Legs", "legs"},
        {"FeetLarge", "Feet Large", "Morphs/Body/Legs", "legs"},
    };
    return morphs;
}

namespace
{

RkFloatProperty* addFloat(RkNode* node, const QString& name, const QString& label,
                          const QString& group, float min, float max, float value)
{
    auto* p = new RkFloatProperty(name, label);
    p->setMinMax(min, max);
    p->setDefaultValue(value);
    p->setValue(value);
    node->addProperty(p, group);
    return p;
}

RkSkeleton* buildFigure(RkScene* scene)
{
    auto* figure = new RkSkeleton;
    figure->setName(QLatin1String(RkDemoFigureName));
    figure->setLabel(QStringLiteral("Demo Figure"));
    figure->setSource(QLatin1String(RkDemoFigureSource));

    for (const RkDemoMorph& m : rkDemoMorphs()) {
        RkFloatProperty* p = addFloat(figure, m.name, m.label, m.group, 0, 1, 0);
        p->setDisplayAsPercent(true);
        p->setClamped(true);
        p->setSensitivity(0.01f);
    }
    // A corrective morph the user is not meant to dial.
    RkFloatProperty* correction =
        addFloat(figure, QStringLiteral("BodyCorrection"), QStringLiteral("Body Correction"),
                 QStringLiteral("Morphs/Body"), 0, 1, 0);
    correction->setHidden(true);
    correction->setDisplayAsPercent(true);

    RkFloatProperty* bend =
        addFloat(figure, QStringLiteral("BendStrength"), QStringLiteral("Bend Strength"),
                 QStringLiteral("Deformers"), 0, 1, 1);
    bend->setDisplayAsPercent(true);
    bend->setClamped(true);
    auto* bending = new RkBoolProperty(QStringLiteral("Bend"), QStringLiteral("Bend"));
    bending->setDefaultValue(true);
    bending->setValue(true);
    figure->addProperty(bending, QStringLiteral("Deformers"));

    // A group without any float property.
    auto* shadows =
        new RkBoolProperty(QStringLiteral("CastShadows"), QStringLiteral("Cast Shadows"));
    shadows->setDefaultValue(true);
    shadows->setValue(true);
    figure->addProperty(shadows, QStringLiteral("Display"));
    auto* level =
        new RkIntProperty(QStringLiteral("SubdivisionLevel"), QStringLiteral("Subdivision Level"));
    level->setMinMax(0, 3);
    level->setClamped(true);
    figure->addProperty(level, QStringLiteral("Display"));

    scene->addNode(figure);

    QHash<QString, RkNode*> byName;
    for (const RkDemoBone& b : rkDemoBones()) {
        auto* bone = new RkBone;
        bone->setName(b.name);
        bone->setLabel(b.label);
        bone->setOrigin(b.origin);
        RkNode* parent = b.parent.isEmpty() ? static_cast<RkNode*>(figure) : byName.value(b.parent);
        bone->setNodeParent(parent);
        // Only the hip moves the figure about; other bones only turn.
        if (b.name != QLatin1String("hip")) {
            for (RkFloatProperty* p :
                 {bone->getXTranslate(), bone->getYTranslate(), bone->getZTranslate()})
                p->setHidden(true);
        }
        bone->getScale()->setHidden(true);
        for (RkFloatProperty* p : {bone->getXRotate(), bone->getYRotate(), bone->getZRotate()})
            p->setClamped(true);
        byName.insert(b.name, bone);
        scene->addNode(bone);
    }
    return figure;
}

} // namespace

// The demo nodes name their content by source; these builders make it whenever such a node is
// built or loaded.
void rkRegisterDemoSources()
{
    RkScene::registerSourceBuilder(QLatin1String(RkDemoFigureSource), &RkDemoMesh::buildFigure);
    RkScene::registerSourceBuilder(QLatin1String(RkDemoPropSource), &RkDemoMesh::buildProp);
}

RkSkeleton* rkBuildDemoScene(RkScene* scene)
{
    rkRegisterDemoSources();
    RkSkeleton* figure = buildFigure(scene);

    auto* prop = new RkNode;
    prop->setName(QLatin1String(RkDemoPropName));
    prop->setLabel(QStringLiteral("Ball"));
    prop->setSource(QLatin1String(RkDemoPropSource));
    prop->setOrigin(QVector3D(0.6f, 0.2f, 0.3f));
    scene->addNode(prop);

    auto* camera = new RkCamera;
    camera->setName(QLatin1String(RkDemoCameraName));
    camera->setLabel(QStringLiteral("Main Camera"));
    camera->setPosition(QVector3D(0.0f, 1.0f, 4.0f));
    scene->addNode(camera);

    auto* light = new RkLight;
    light->setName(QLatin1String(RkDemoLightName));
    light->setLabel(QStringLiteral("Key Light"));
    light->getXRotate()->setValue(-40);
    light->getYRotate()->setValue(30);
    scene->addNode(light);

    for (RkNode* node : {static_cast<RkNode*>(figure), prop})
        RkScene::buildFromSource(node);
    return figure;
}
