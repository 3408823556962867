// Curves through data: least-squares polynomials with their confidence bands, and local
// regression. Fit lines and interpolation lines draw these.
#ifndef PLOTAID_RENDER_MARKS_SMOOTH_H
#define PLOTAID_RENDER_MARKS_SMOOTH_H

#include <cstddef>
#include <vector>

namespace plotaid::render {

struct PolyFit {
    bool ok = false;
    int degree = 0;
    double centre = 0, scale = 1;             // x is fitted as (x - centre) / scale, which keeps cubes of
                                              // large values well conditioned
    std::vector<double> coef;                 // lowest power first
    std::vector<std::vector<double>> inverse; // of the normal matrix
    double sigma = 0;                         // residual standard deviation
    std::size_t n = 0;

    double at(double x) const;
    // Half the width of the band at x: `t` standard errors of the mean, or of one new value
    // when `individual`.
    double halfWidth(double x, double t, bool individual) const;
};

// Degree 0 (the mean) to 3; not ok with fewer distinct points than the degree needs.
PolyFit fitPolynomial(const std::vector<double>& x, const std::vector<double>& y, int degree);

// Local linear regression at x0 with tricube weights over the nearest `proportion` of the points.
double loessAt(const std::vector<double>& x, const std::vector<double>& y, double x0, double proportion);

} // namespace plotaid::render

#endif
