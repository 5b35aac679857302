#pragma once

#include <QString>
#include <QVector3D>
#include <QVector>

class RkScene;
class RkSkeleton;

// The built-in demo content: a figure with a bone hierarchy and morphs, a prop, a camera and a
// light. Geometry is added by the builders registered for the nodes' sources
// (RkScene::registerSourceBuilder): "demo:figure" and "demo:prop".

// One bone of the demo figure. Left is +X; the figure stands on y = 0 and faces +Z.
struct RkDemoBone {
    QString name;
    QString label;
    QString parent; // empty: the figure itself
    QVector3D origin;
};

// One morph of the demo figure. region names the part of the body it deforms: "head",
// "face", "ears", "body", "arms" or "legs".
struct RkDemoMorph {
    QString name;
    QString label;
    QString group;
    QString region;
};

const QVector<RkDemoBone>& rkDemoBones();
const QVector<RkDemoMorph>& rkDemoMorphs();

// Object names and sources of the demo nodes.
extern const char* const RkDemoFigureName;   // "Figure"
extern const char* const RkDemoPropName;     // "Prop"
extern const char* const RkDemoCameraName;   // "Camera"
extern const char* const RkDemoLightName;    // "Light"
extern const char* const RkDemoFigureSource; // "demo:figure"
extern const char* const RkDemoPropSource;   // "demo:prop"

// Registers the builders of the demo sources with the scene, so that demo nodes get their meshes
// when built or loaded. Safe to call more than once; rkBuildDemoScene() calls it.
void rkRegisterDemoSources();

// Adds the demo content to the scene (which keeps what it holds) and returns the figure.
RkSkeleton* rkBuildDemoScene(RkScene* scene);
