#pragma once

#include "geometry/rkvec3.h"
#include "rkcoreglobal.h"

#include <QColor>
#include <QImage>
#include <QMatrix4x4>
#include <QVector>

class RkGeometry;

// Draws meshes with OpenGL 1.x into the current context: smooth shaded, one colour per material
// (and its texture, where it has one), lit by a key and a fill light. Kept apart from any widget so
// that the on-screen view and the offscreen renders share one path.
class RKCORE_EXPORT RkSceneRenderer
{
public:
    // An orbit camera: it looks at target from distance, turned by yaw about the vertical axis
    // and by pitch above the horizon (degrees).
    struct Camera {
        RkVec3 target;
        float yaw = 0.0f;
        float pitch = 0.0f;
        float distance = 5.0f;
        float fovY = 35.0f;

        RkVec3 eye() const;
        QMatrix4x4 view() const;
        QMatrix4x4 projection(float aspect) const;
    };

    // One mesh to draw. positions, when given, replace the geometry's own (for example the
    // deformed vertices); they must hold one entry per vertex or the mesh is drawn undeformed.
    struct Item {
        const RkGeometry* geometry = nullptr;
        const QVector<RkVec3>* positions = nullptr;
        QVector<QColor> materialColours; // by material index; missing ones are grey
        // By material index: a picture mapped by the geometry's UVs and tinted by the colour.
        QVector<QImage> materialTextures;
        bool highlighted = false;
    };

    enum Option { NoOptions = 0, DrawGround = 1, DrawHighlight = 2 };
    Q_DECLARE_FLAGS(Options, Option)

    RkSceneRenderer();
    ~RkSceneRenderer();

    // Clears to background and draws the items into a viewport of w by h pixels.
    void draw(const QVector<Item>& items, const Camera& camera, int w, int h,
              const QColor& background, Options options = NoOptions);

    // The item whose surface is nearest under the pixel (x, y), counted from the top-left of a
    // w by h view; -1 when the ray hits nothing.
    static int pick(const QVector<Item>& items, const Camera& camera, int w, int h, int x, int y);

    // Bounds of all items' (deformed) vertices; false when there are none.
    static bool bounds(const QVector<Item>& items, RkVec3& min, RkVec3& max);

private:
    struct Private;
    std::unique_ptr<Private> d;
};

Q_DECLARE_OPERATORS_FOR_FLAGS(RkSceneRenderer::Options)
