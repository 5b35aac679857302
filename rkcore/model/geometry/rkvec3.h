#pragma once

#include "rkcoreglobal.h"

// A 3D vector of floats: positions, normals and offsets of meshes.
class RKCORE_EXPORT RkVec3
{
public:
    float x = 0.0f;
    float y = 0.0f;
    float z = 0.0f;

    RkVec3() = default;
    RkVec3(float x_, float y_, float z_) : x(x_), y(y_), z(z_) {}

    RkVec3 operator+(const RkVec3& o) const { return RkVec3(x + o.x, y + o.y, z + o.z); }
    RkVec3 operator-(const RkVec3& o) const { return RkVec3(x - o.x, y - o.y, z - o.z); }
    RkVec3 operator-() const { return RkVec3(-x, -y, -z); }
    RkVec3 operator*(float s) const { return RkVec3(x * s, y * s, z * s); }
    RkVec3& operator+=(const RkVec3& o)
    {
        x += o.x;
        y += o.y;
        z += o.z;
        return *this;
    }
    RkVec3& operator-=(const RkVec3& o)
    {
        x -= o.x;
        y -= o.y;
        z -= o.z;
        return *this;
    }
    RkVec3& operator*=(float s)
    {
        x *= s;
        y *= s;
        z *= s;
        return *this;
    }
    bool operator==(const RkVec3& o) const { return x == o.x && y == o.y && z == o.z; }
    bool operator!=(const RkVec3& o) const { return !(*this == o); }

    float dot(const RkVec3& o) const { return x * o.x + y * o.y + z * o.z; }
    RkVec3 cross(const RkVec3& o) const;
    float length() const;
    float lengthSquared() const { return dot(*this); }

    // Scales the vector to length 1 and returns the old length. A zero vector (or one too short to
    // give a direction, or one that is not finite) has no direction: it becomes and stays zero.
    float normalize();
    RkVec3 normalized() const;
};
