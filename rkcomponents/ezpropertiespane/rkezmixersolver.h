#pragma once

#include <QPoint>
#include <QVector>

#include <vector>

// The interpolation behind a mixer: given the points of its controls on the mixer field, finds for
// any driver point one weight per control, 1 on that control's point, 0 on every other control's
// point and continuous in between (radial-basis interpolation with the distance itself as the
// radial term, plus a linear term along the controls' line or over the plane).
//
// Plain numbers only, so that tests and benchmarks can drive it without a scene or a window.
class RkEzMixerSolver
{
public:
    enum Layout {
        None,  // fewer than two controls: nothing to interpolate
        Line,  // the controls lie (about) on one line: linear term along it, system size N + 2
        Plane, // the controls spread over the field: linear terms in x and y, system size N + 3
    };

    RkEzMixerSolver();
    explicit RkEzMixerSolver(const QVector<QPoint>& points) { setPoints(points); }

    // Takes a new set of control points and builds the interpolation system for them.
    void setPoints(const QVector<QPoint>& points);

    Layout layout() const { return m_layout; }
    int controlCount() const { return m_count; }
    int systemSize() const { return m_size; }
    const QVector<QPoint>& points() const { return m_points; }
    // Row-major system matrix, systemSize() squared.
    const std::vector<double>& matrix() const { return m_matrix; }

    // The weights for a driver at the given point, one per control, in control order. One
    // factorisation of the system and one solve: the system is symmetric, so the weights are the
    // solution of A w = phi(driver). Returns false, and leaves weights untouched, when there is
    // nothing to interpolate or the system is singular or the result is not finite.
    bool weights(const QPoint& driver, QVector<float>& weights);

    // Whether the points count as lying on one line (every point within a small angle of the
    // direction from the first point to the second).
    static Layout classify(const QVector<QPoint>& points);

    // Gaussian elimination with scaled partial pivoting, in place on a row-major n by n matrix.
    // Each row's scale is its largest absolute entry; the pivot row is the one with the largest
    // entry relative to its scale. Rows are not moved: index records their order. The multipliers
    // are kept where the eliminated entries were, for solve(). Returns false for a singular matrix
    // (a pivot at or below 1e-12 of its row's scale, or a row that is zero or not finite).
    static bool decompose(double* a, int n, int* index, double* scale);
    // Solves with a matrix that decompose() has worked on. b is used up; x receives the solution.
    static void solve(const double* a, int n, const int* index, double* b, double* x);

private:
    void evaluateBasis(const QPoint& driver, std::vector<double>& phi) const;

    Layout m_layout = None;
    int m_count = 0;
    int m_size = 0;
    float m_originX = 0.f, m_originY = 0.f; // first control's point
    float m_dirX = 0.f, m_dirY = 0.f;       // unit direction of the line, zero when undefined
    QVector<QPoint> m_points;
    std::vector<double> m_matrix;
    // Scratch space for the fast path, kept so that a move allocates nothing.
    std::vector<double> m_lu;
    std::vector<double> m_scale;
    std::vector<double> m_rhs;
    std::vector<double> m_solution;
    std::vector<int> m_index;
};
