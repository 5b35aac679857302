#include "geometry/rkxform.h"

#include <cmath>

RkXform RkXform::translation(const RkVec3& offset)
{
    RkXform x;
    x.t = offset;
    return x;
}

RkXform RkXform::rotationXYZ(float xDeg, float yDeg, float zDeg)
{
    const float d2r = float(M_PI / 180.0);
    const float cx = std::cos(xDeg * d2r), sx = std::sin(xDeg * d2r);
    const float cy = std::cos(yDeg * d2r), sy = std::sin(yDeg * d2r);
    const float cz = std::cos(zDeg * d2r), sz = std::sin(zDeg * d2r);
    // R = Rz * Ry * Rx
    RkXform x;
    x.r[0] = cz * cy;
    x.r[1] = cz * sy * sx - sz * cx;
    x.r[2] = cz * sy * cx + sz * sx;
    x.r[3] = sz * cy;
    x.r[4] = sz * sy * sx + cz * cx;
    x.r[5] = sz * sy * cx - cz * sx;
    x.r[6] = -sy;
    x.r[7] = cy * sx;
    x.r[8] = cy * cx;
    return x;
}

RkXform RkXform::rotationAbout(const RkVec3& centre, float xDeg, float yDeg, float zDeg)
{
    return translation(centre) * rotationXYZ(xDeg, yDeg, zDeg) * translation(-centre);
}

RkVec3 RkXform::applyRotation(const RkVec3& v) const
{
    return RkVec3(r[0] * v.x + r[1] * v.y + r[2] * v.z, r[3] * v.x + r[4] * v.y + r[5] * v.z,
                  r[6] * v.x + r[7] * v.y + r[8] * v.z);
}

RkVec3 RkXform::apply(const RkVec3& p) const
{
    return applyRotation(p) + t;
}

RkXform RkXform::operator*(const RkXform& o) const
{
    RkXform out;
    for (int i = 0; i < 3; ++i) {
        for (int j = 0; j < 3; ++j) {
            out.r[3 * i + j] =
                r[3 * i] * o.r[j] + r[3 * i + 1] * o.r[3 + j] + r[3 * i + 2] * o.r[6 + j];
        }
    }
    out.t = applyRotation(o.t) + t;
    return out;
}

bool RkXform::isIdentity() const
{
    static const float id[9] = {1, 0, 0, 0, 1, 0, 0, 0, 1};
    for (int i = 0; i < 9; ++i) {
        if (r[i] != id[i])
            return false;
    }
    return t == RkVec3();
}
