#include "rkezmixerreference.h"

#include "rkezmixersolver.h"

#include <algorithm>
#include <cmath>
#include <vector>

namespace
{

// The same pivot limit as the solver's, so that both refuse the same systems.
constexpr double kPivotTolerance = 1e-12;

// The basis is built in single precision, as the solver builds it, so that both interpolate
// exactly the same function.
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

std::vector<double> basis(const RkEzMixerSolver& solver, const QPoint& driver)
{
    const QVector<QPoint>& points = solver.points();
    const int n = solver.controlCount();
    std::vector<double> phi(size_t(solver.systemSize()), 0.0);
    for (int i = 0; i < n; ++i)
        phi[i] = distance(driver, points[i]);
    phi[n] = 1.0;
    if (solver.layout() == RkEzMixerSolver::Line) {
        const float originX = float(points[0].x());
        const float originY = float(points[0].y());
        float dirX = float(points[1].x()) - originX;
        float dirY = float(points[1].y()) - originY;
        normalize(dirX, dirY);
        phi[n + 1] = (float(driver.x()) - originX) * dirX + (float(driver.y()) - originY) * dirY;
    } else {
        phi[n + 1] = driver.x();
        phi[n + 2] = driver.y();
    }
    return phi;
}

// Gaussian elimination with scaled partial pivoting, in place on a row-major n by n matrix; rows
// stay where they are and index records their order. Returns false for a singular matrix.
bool decompose(double* a, int n, int* index, double* scale)
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

// Solves with a matrix that decompose() has worked on. b is used up; x receives the solution.
void solve(const double* a, int n, const int* index, double* b, double* x)
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

} // namespace

bool rkEzMixerReferenceWeights(const RkEzMixerSolver& solver, const QPoint& driver,
                               QVector<float>& weights)
{
    if (solver.layout() == RkEzMixerSolver::None)
        return false;
    const int n = solver.controlCount();
    const int k = solver.systemSize();
    const size_t size = size_t(k);
    std::vector<double> a, scale(size), b(size), c(size);
    std::vector<int> index(size);
    const std::vector<double> phi = basis(solver, driver);

    QVector<float> result(n);
    for (int control = 0; control < n; ++control) {
        a = solver.matrix();
        if (!decompose(a.data(), k, index.data(), scale.data()))
            return false;
        std::fill(b.begin(), b.end(), 0.0);
        b[size_t(control)] = 1.0;
        solve(a.data(), k, index.data(), b.data(), c.data());

        float w = 0.f;
        for (int i = 0; i < k; ++i)
            w += c[i] * phi[i];
        if (!std::isfinite(w))
            return false;
        result[control] = w;
    }
    weights = result;
    return true;
}
