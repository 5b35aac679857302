#pragma once

#include "rkcoreglobal.h"

#include <QVector>

// One 2D point of a map, for example a texture coordinate (u, v).
struct RkPnt2 {
    float x = 0.0f;
    float y = 0.0f;
};

// A map of per-corner values of a geometry, such as its texture coordinates. The values are stored
// packed, getDimension() floats each; the type says how to read them.
class RKCORE_EXPORT RkMap
{
public:
    enum Type { Scalar = 0, Point2D = 1, Point3D = 2 };

    explicit RkMap(Type type = Point2D);
    ~RkMap();

    Type getType() const { return m_type; }
    int getDimension() const;
    int getNumValues() const;

    // Point access for 2D maps; null for other types or an empty map.
    const RkPnt2* getPnt2ArrayPtr() const;
    RkPnt2* getPnt2ArrayPtr();
    RkPnt2 getPnt2(int index) const;
    void setPnt2(int index, float x, float y);
    int addPnt2(float x, float y);

    // Raw values, getDimension() per entry.
    const float* getValuesPtr() const { return m_values.constData(); }
    void setValues(const QVector<float>& values);
    void clear() { m_values.clear(); }

private:
    Type m_type;
    QVector<float> m_values;
};
