#include "geometry/rkvec3.h"

#include <cmath>

RkVec3 RkVec3::cross(const RkVec3& o) const
{
    return RkVec3(y * o.z - z * o.y, z * o.x - x * o.z, x * o.y - y * o.x);
}

float RkVec3::length() const
{
    return std::sqrt(lengthSquared());
}

float RkVec3::normalize()
{
    const float len = length();
    if (!(len > 1e-20f) || !std::isfinite(len)) {
        x = y = z = 0.0f;
        return 0.0f;
    }
    const float inv = 1.0f / len;
    x *= inv;
    y *= inv;
    z *= inv;
    return len;
}

RkVec3 RkVec3::normalized() const
{
    RkVec3 v = *this;
    v.normalize();
    return v;
}
