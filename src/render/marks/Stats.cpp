#include "render/marks/Stats.h"

#include <algorithm>
#include <cmath>

namespace plotaid::render {

std::vector<double> sortedFinite(const std::vector<double>& values) {
    std::vector<double> v;
    for (double d : values)
        if (std::isfinite(d))
            v.push_back(d);
    std::sort(v.begin(), v.end());
    return v;
}

double quantile(const std::vector<double>& sorted, double p) {
    const std::size_t n = sorted.size();
    if (n == 0)
        return NAN;
    const double h = std::clamp(p * static_cast<double>(n + 1), 1.0, static_cast<double>(n));
    const auto lo = static_cast<std::size_t>(std::floor(h));
    const double f = h - static_cast<double>(lo);
    return lo >= n ? sorted[n - 1] : sorted[lo - 1] + f * (sorted[lo] - sorted[lo - 1]);
}

double mean(const std::vector<double>& values) {
    double sum = 0;
    std::size_t n = 0;
    for (double d : values)
        if (std::isfinite(d)) {
            sum += d;
            ++n;
        }
    return n ? sum / static_cast<double>(n) : NAN;
}

double standardDeviation(const std::vector<double>& values) {
    const double m = mean(values);
    double sum = 0;
    std::size_t n = 0;
    for (double d : values)
        if (std::isfinite(d)) {
            sum += (d - m) * (d - m);
            ++n;
        }
    return n > 1 ? std::sqrt(sum / static_cast<double>(n - 1)) : NAN;
}

double normalQuantile(double p) {
    if (!(p > 0 && p < 1))
        return NAN;
    // Acklam's rational approximation, good to about 1e-9.
    static const double a[] = {-3.969683028665376e+01, 2.209460984245205e+02,  -2.759285104469687e+02,
                               1.383577518672690e+02,  -3.066479806614716e+01, 2.506628277459239e+00};
    static const double b[] = {-5.447609879822406e+01, 1.615858368580409e+02, -1.556989798598866e+02,
                               6.680131188771972e+01, -1.328068155288572e+01};
    static const double c[] = {-7.784894002430293e-03, -3.223964580411365e-01, -2.400758277161838e+00,
                               -2.549732539343734e+00, 4.374664141464968e+00,  2.938163982698783e+00};
    static const double d[] = {7.784695709041462e-03, 3.224671290700398e-01, 2.445134137142996e+00,
                               3.754408661907416e+00};
    const double low = 0.02425;
    if (p < low || p > 1 - low) {
        const double q = std::sqrt(-2 * std::log(p < low ? p : 1 - p));
        const double x = (((((c[0] * q + c[1]) * q + c[2]) * q + c[3]) * q + c[4]) * q + c[5]) /
                         ((((d[0] * q + d[1]) * q + d[2]) * q + d[3]) * q + 1);
        return p < low ? x : -x;
    }
    const double q = p - 0.5, r = q * q;
    return (((((a[0] * r + a[1]) * r + a[2]) * r + a[3]) * r + a[4]) * r + a[5]) * q /
           (((((b[0] * r + b[1]) * r + b[2]) * r + b[3]) * r + b[4]) * r + 1);
}

double tQuantile(double p, double df) {
    if (!(p > 0 && p < 1) || !(df >= 1))
        return NAN;
    if (df < 1.5)
        return std::tan(M_PI * (p - 0.5));
    if (df < 2.5)
        return (2 * p - 1) / std::sqrt(2 * p * (1 - p));
    // Cornish-Fisher expansion about the normal quantile; within 1e-3 from three degrees up.
    const double z = normalQuantile(p), z2 = z * z;
    const double g1 = (z2 + 1) * z / 4;
    const double g2 = ((5 * z2 + 16) * z2 + 3) * z / 96;
    const double g3 = (((3 * z2 + 19) * z2 + 17) * z2 - 15) * z / 384;
    const double g4 = ((((79 * z2 + 776) * z2 + 1482) * z2 - 1920) * z2 - 945) * z / 92160;
    return z + g1 / df + g2 / (df * df) + g3 / (df * df * df) + g4 / (df * df * df * df);
}

double tCritical(double level, double df) {
    if (!std::isfinite(level))
        level = 0.95;
    level = std::clamp(level < 0.5 ? 1 - level : level, 0.5, 0.9999);
    const double p = 0.5 + level / 2;
    return df >= 1 ? tQuantile(p, df) : normalQuantile(p);
}

} // namespace plotaid::render
