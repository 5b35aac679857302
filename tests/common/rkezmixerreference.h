#pragma once

#include <QPoint>
#include <QVector>

class RkEzMixerSolver;

// A mixer's weights the long way round, from the solver's points, layout and matrix: one
// elimination of the whole system per control for its coefficients, then the interpolant
// evaluated at the driver with the sum kept in single precision. The fast path is checked against
// it and measured by it. Returns false, and leaves weights untouched, when there is nothing to
// interpolate, the system is singular or a weight is not finite.
bool rkEzMixerReferenceWeights(const RkEzMixerSolver& solver, const QPoint& driver,
                               QVector<float>& weights);
