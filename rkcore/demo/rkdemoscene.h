#pragma once

#include "rkcoreglobal.h"

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

RKCORE_EXPORT const QVector<RkDemoBone>& rkDemoBones();
RKCORE_EXPORT const QVector<RkDemoMorph>& rkDemoMorphs();

// Object names and sources of the demo nodes.
RKCORE_EXPORT extern const char* const RkDemoFigureName;   // "Figure"
RKCORE_EXPORT extern const char* const RkDemoPropName;     // "Prop"
RKCORE_EXPORT extern const char* const RkDemoCameraName;   // "Camera"
RKCORE_EXPORT extern const char* const RkDemoLightName;    // "Light"
RKCORE_EXPORT extern const char* const RkDemoFigureSource; // "demo:figure"
RKCORE_EXPORT extern const char* const RkDemoPropSource;   // "demo:prop"

// Adds the demo content to the scene (which keeps what it holds) and returns the figure.
RKCORE_EXPORT RkSkeleton* rkBuildDemoScene(RkScene* scene);
