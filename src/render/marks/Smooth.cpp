#include "render/marks/Smooth.h"

#include <algorithm>
#include <cmath>
#include <numeric>

namespace plotaid::render {

namespace {

// Gauss-Jordan inverse with partial pivoting; false when the matrix is singular.
bool invert(std::vector<std::vector<double>> a, std::vector<std::vector<double>>& out) {
    const std::size_t n = a.size();
    out.assign(n, std::vector<double>(n, 0));
    for (std::size_t i = 0; i < n; ++i)
        out[i][i] = 1;
    for (std::size_t c = 0; c < n; ++c) {
        std::size_t pivot = c;
        for (std::size_t r = c + 1; r < n; ++r)
            if (std::fabs(a[r][c]) > std::fabs(a[pivot][c]))
                pivot = r;
        if (!(std::fabs(a[pivot][c]) > 1e-12))
            return false;
        std::swap(a[c], a[pivot]);
        std::swap(out[c], out[pivot]);
        const double d = a[c][c];
        for (std::size_t k = 0; k < n; ++k) {
            a[c][k] /= d;
            out[c][k] /= d;
        }
        for (std::size_t r = 0; r < n; ++r) {
            if (r == c || a[r][c] == 0)
                continue;
            const double f = a[r][c];
            for (std::size_t k = 0; k < n; ++k) {
                a[r][k] -= f * a[c][k];
                out[r][k] -= f * out[c][k];
            }
        }
    }
    return true;
}

std::vector<double> powers(double u, int degree) {
    std::vector<double> p(static_cast<std::size_t>(degree) + 1, 1);
    for (std::size_t k = 1; k < p.size(); ++k)
        p[k] = p[k - 1] * u;
    return p;
}

} // namespace

double PolyFit::at(double x) const {
    if (!ok)
        return NAN;
    const auto p = powers((x - centre) / scale, degree);
    return std::inner_product(p.begin(), p.end(), coef.begin(), 0.0);
}

double PolyFit::halfWidth(double x, double t, bool individual) const {
    if (!ok || n <= coef.size())
        return NAN;
    const auto p = powers((x - centre) / scale, degree);
    double q = 0;
    for (std::size_t i = 0; i < p.size(); ++i)
        for (std::size_t j = 0; j < p.size(); ++j)
            q += p[i] * inverse[i][j] * p[j];
    return t * sigma * std::sqrt(std::max(0.0, q + (individual ? 1 : 0)));
}

PolyFit fitPolynomial(const std::vector<double>& x, const std::vector<double>& y, int degree) {
    PolyFit f;
    f.degree = std::clamp(degree, 0, 3);
    f.n = std::min(x.size(), y.size());
    const std::size_t terms = static_cast<std::size_t>(f.degree) + 1;
    if (f.n < terms)
        return f;
    double sum = 0, squares = 0;
    for (std::size_t i = 0; i < f.n; ++i)
        sum += x[i];
    f.centre = sum / static_cast<double>(f.n);
    for (std::size_t i = 0; i < f.n; ++i)
        squares += (x[i] - f.centre) * (x[i] - f.centre);
    const double sd = std::sqrt(squares / static_cast<double>(f.n));
    f.scale = sd > 0 ? sd : 1;
    std::vector<std::vector<double>> normal(terms, std::vector<double>(terms, 0));
    std::vector<double> right(terms, 0);
    for (std::size_t i = 0; i < f.n; ++i) {
        const auto p = powers((x[i] - f.centre) / f.scale, f.degree);
        for (std::size_t a = 0; a < terms; ++a) {
            right[a] += p[a] * y[i];
            for (std::size_t b = 0; b < terms; ++b)
                normal[a][b] += p[a] * p[b];
        }
    }
    if (!invert(normal, f.inverse))
        return f;
    f.coef.assign(terms, 0);
    for (std::size_t a = 0; a < terms; ++a)
        for (std::size_t b = 0; b < terms; ++b)
            f.coef[a] += f.inverse[a][b] * right[b];
    f.ok = true;
    double residual = 0;
    for (std::size_t i = 0; i < f.n; ++i)
        residual += (y[i] - f.at(x[i])) * (y[i] - f.at(x[i]));
    f.sigma = f.n > terms ? std::sqrt(residual / static_cast<double>(f.n - terms)) : 0;
    return f;
}

double loessAt(const std::vector<double>& x, const std::vector<double>& y, double x0, double proportion) {
    const std::size_t n = std::min(x.size(), y.size());
    if (n == 0)
        return NAN;
    std::vector<double> distance(n);
    for (std::size_t i = 0; i < n; ++i)
        distance[i] = std::fabs(x[i] - x0);
    std::vector<double> sorted = distance;
    const std::size_t k = std::clamp<std::size_t>(
        static_cast<std::size_t>(std::ceil(std::clamp(proportion, 0.05, 1.0) * static_cast<double>(n))), 2,
        n);
    std::nth_element(sorted.begin(), sorted.begin() + static_cast<std::ptrdiff_t>(k - 1), sorted.end());
    const double reach = sorted[k - 1] > 0 ? sorted[k - 1] * 1.0001 : 1;
    double sw = 0, sx = 0, sy = 0, sxx = 0, sxy = 0;
    for (std::size_t i = 0; i < n; ++i) {
        const double d = distance[i] / reach;
        if (d >= 1)
            continue;
        const double w = std::pow(1 - d * d * d, 3);
        const double u = x[i] - x0;
        sw += w;
        sx += w * u;
        sy += w * y[i];
        sxx += w * u * u;
        sxy += w * u * y[i];
    }
    if (!(sw > 0))
        return NAN;
    const double det = sw * sxx - sx * sx;
    // Where the neighbours share one x the local line has no slope: their weighted mean.
    return std::fabs(det) > 1e-12 * sw * sw ? (sxx * sy - sx * sxy) / det : sy / sw;
}

} // namespace plotaid::render
