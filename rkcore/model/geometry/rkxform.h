#pragma once

#include "geometry/rkvec3.h"
#include "rkcoreglobal.h"

// An affine transform: a 3x3 linear part (row-major; a rotation, possibly scaled) followed by a
// translation. p' = R p + t.
class RKCORE_EXPORT RkXform
{
public:
    float r[9] = {1, 0, 0, 0, 1, 0, 0, 0, 1};
    RkVec3 t;

    static RkXform identity() { return RkXform(); }
    static RkXform translation(const RkVec3& offset);
    // Rotation by Euler angles in degrees, applied about x first, then y, then z.
    static RkXform rotationXYZ(float xDeg, float yDeg, float zDeg);
    // The same rotation turning about centre instead of the origin.
    static RkXform rotationAbout(const RkVec3& centre, float xDeg, float yDeg, float zDeg);

    RkVec3 apply(const RkVec3& p) const;
    RkVec3 applyRotation(const RkVec3& v) const;
    // this after other: (a * b).apply(p) == a.apply(b.apply(p)).
    RkXform operator*(const RkXform& other) const;
    bool isIdentity() const;
};
