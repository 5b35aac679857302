#include "rkezmixersolver.h"

#include <algorithm>
#include <cmath>

namespace
{

// Points whose direction from the first point is within this (1 - |cos|) of the first pair's
// direction count as lying on that line.
constexpr float kCollinearLimit = 0.1f;

// A pivot smaller than this, relative to the largest entry of its row, means the system is
// singular (two controls on one point) or too ill-conditioned to give usable weights.
constexpr double kPivotTolerance = 1e-12;

// Unit vector along (x, y); a zero vector stays zero.
void normalize(float& x, float& y)
{
    const float length = std::sqrt(x * x + y * y);
    if (length > 0.f) {
        x /= length;
        y /= length;
    }
}

float distance(const QPoint& a, const QPoint& b)
{
    const float dx = float(a.x() - b.x());
    const float dy = float(a.y() - b.y());
    return std::sqrt(dx * dx + dy * dy);
}

} // namespace

bool RkEzMixerSolver::decompose(double* a, int n, int* index, double* scale)
{
    for (int i = 0; i < n; ++i) {
        index[i] = i;
        double s = 0.0;
        const double* row = a + i * n;
        for (int j = 0; j < n; ++j)
            s = std::max(s, std::fabs(row[j]));
        if (!(s > 0.0) || !std::isfinite(s))
            return false;
        scale[i] = s;
    }
    for (int k = 0; k < n; ++k) {
        double best = -1.0;
        int bestRow = k;
        for (int i = k; i < n; ++i) {
            const double r = std::fabs(a[index[i] * n + k]) / scale[index[i]];
            if (r > best) {
                best = r;
                bestRow = i;
            }
        }
        std::swap(index[k], index[bestRow]);
        if (!(best > kPivotTolerance) || !std::isfinite(best))
            return false;
        const double* __restrict pivotRow = a + index[k] * n;
        const double pivot = pivotRow[k];
        for (int i = k + 1; i < n; ++i) {
            double* __restrict row = a + index[i] * n;
            const double m = row[k] / pivot;
            row[k] = m;
            if (m == 0.0)
                continue;
            for (int j = k + 1; j < n; ++j)
                row[j] -= m * pivotRow[j];
        }
    }
    return true;
}

void RkEzMixerSolver::solve(const double* a, int n, const int* index, double* b, double* x)
{
    for (int k = 0; k < n - 1; ++k) {
        const double bk = b[index[k]];
        if (bk == 0.0)
            continue;
        for (int i = k + 1; i < n; ++i)
            b[index[i]] -= a[index[i] * n + k] * bk;
    }
    for (int i = n - 1; i >= 0; --i) {
        const double* row = a + index[i] * n;
        double s = b[index[i]];
        for (int j = i + 1; j < n; ++j)
            s -= row[j] * x[j];
        x[i] = s / row[i];
    }
}

RkEzMixerSolver::RkEzMixerSolver() = default;

RkEzMixerSolver::Layout RkEzMixerSolver::classify(const QVector<QPoint>& points)
{
    const int n = points.size();
    if (n < 2)
        return None;
    const QPoint& origin = points[0];
    float ux = float(points[1].x() - origin.x());
    float uy = float(points[1].y() - origin.y());
    normalize(ux, uy);
    for (int i = 2; i < n; ++i) {
        float vx = float(points[i].x() - origin.x());
        float vy = float(points[i].y() - origin.y());
        normalize(vx, vy);
        // A zero direction (a point on the first one, or the first two on one spot) gives a
        // zero dot product and so counts as off the line.
        if (1.f - std::fabs(ux * vx + uy * vy) > kCollinearLimit)
            return Plane;
    }
    return Line;
}

void RkEzMixerSolver::setPoints(const QVector<QPoint>& points)
{
    m_points = points;
    m_count = points.size();
    m_layout = classify(points);
    m_size = m_layout == Line ? m_count + 2 : m_layout == Plane ? m_count + 3 : 0;
    m_matrix.assign(size_t(m_size) * size_t(m_size), 0.0);
    if (m_layout == None)
        return;

    const int n = m_count;
    const int k = m_size;
    m_originX = float(points[0].x());
    m_originY = float(points[0].y());
    m_dirX = float(points[1].x()) - m_originX;
    m_dirY = float(points[1].y()) - m_originY;
    normalize(m_dirX, m_dirY);

    double* a = m_matrix.data();
    for (int i = 0; i < n; ++i) {
        for (int j = i + 1; j < n; ++j)
            a[i * k + j] = a[j * k + i] = distance(points[i], points[j]);
        a[i * k + n] = a[n * k + i] = 1.0;
        if (m_layout == Line) {
            const float t = (float(points[i].x()) - m_originX) * m_dirX +
                            (float(points[i].y()) - m_originY) * m_dirY;
            a[i * k + n + 1] = a[(n + 1) * k + i] = t;
        } else {
            a[i * k + n + 1] = a[(n + 1) * k + i] = points[i].x();
            a[i * k + n + 2] = a[(n + 2) * k + i] = points[i].y();
        }
    }
}

// The basis at the driver: its distance to every control, then the constant and linear terms.
void RkEzMixerSolver::evaluateBasis(const QPoint& driver, std::vector<double>& phi) const
{
    const int n = m_count;
    phi.assign(size_t(m_size), 0.0);
    for (int i = 0; i < n; ++i)
        phi[i] = distance(driver, m_points[i]);
    phi[n] = 1.0;
    if (m_layout == Line) {
        phi[n + 1] =
            (float(driver.x()) - m_originX) * m_dirX + (float(driver.y()) - m_originY) * m_dirY;
    } else {
        phi[n + 1] = driver.x();
        phi[n + 2] = driver.y();
    }
}

bool RkEzMixerSolver::weights(const QPoint& driver, QVector<float>& weights)
{
    if (m_layout == None)
        return false;
    const int k = m_size;
    m_lu = m_matrix;
    m_scale.resize(size_t(k));
    m_index.resize(size_t(k));
    if (!decompose(m_lu.data(), k, m_index.data(), m_scale.data()))
        return false;
    evaluateBasis(driver, m_rhs);
    m_solution.resize(size_t(k));
    const std::vector<double>& x = m_solution;
    solve(m_lu.data(), k, m_index.data(), m_rhs.data(), m_solution.data());

    for (int i = 0; i < m_count; ++i) {
        if (!std::isfinite(float(x[i])))
            return false;
    }
    weights.resize(m_count);
    for (int i = 0; i < m_count; ++i)
        weights[i] = float(x[i]);
    return true;
}
