#include "geometry/rkmap.h"

static_assert(sizeof(RkPnt2) == 2 * sizeof(float), "RkPnt2 must be two packed floats");

RkMap::RkMap(Type type) : m_type(type) {}

RkMap::~RkMap() = default;

int RkMap::getDimension() const
{
    switch (m_type) {
    case Scalar:
        return 1;
    case Point2D:
        return 2;
    case Point3D:
        return 3;
    }
    return 1;
}

int RkMap::getNumValues() const
{
    return m_values.size() / getDimension();
}

const RkPnt2* RkMap::getPnt2ArrayPtr() const
{
    if (m_type != Point2D || m_values.isEmpty())
        return nullptr;
    return reinterpret_cast<const RkPnt2*>(m_values.constData());
}

RkPnt2* RkMap::getPnt2ArrayPtr()
{
    if (m_type != Point2D || m_values.isEmpty())
        return nullptr;
    return reinterpret_cast<RkPnt2*>(m_values.data());
}

RkPnt2 RkMap::getPnt2(int index) const
{
    RkPnt2 p;
    if (m_type != Point2D || index < 0 || index >= getNumValues())
        return p;
    p.x = m_values[2 * index];
    p.y = m_values[2 * index + 1];
    return p;
}

void RkMap::setPnt2(int index, float x, float y)
{
    if (m_type != Point2D || index < 0 || index >= getNumValues())
        return;
    m_values[2 * index] = x;
    m_values[2 * index + 1] = y;
}

int RkMap::addPnt2(float x, float y)
{
    if (m_type != Point2D)
        return -1;
    m_values.append(x);
    m_values.append(y);
    return getNumValues() - 1;
}

void RkMap::setValues(const QVector<float>& values)
{
    m_values = values;
    // A trailing partial entry is no value at all.
    m_values.resize(m_values.size() - m_values.size() % getDimension());
}
