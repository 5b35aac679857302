// The reference shares the solver's elimination (RkEzMixerSolver::decompose and solve), so
// both refuse the same systems; it differs in solving once per control.
#include "rkezmixerreference.h"

#include "rkezmixersolver.h"

#include <algorithm>
#include <cmath>
#include <vector>

namespace
{

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
        if (!RkEzMixerSolver::decompose(a.data(), k, index.data(), scale.data()))
            return false;
        std::fill(b.begin(), b.end(), 0.0);
        b[size_t(control)] = 1.0;
        RkEzMixerSolver::solve(a.data(), k, index.data(), b.data(), c.data());

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
