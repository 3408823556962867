// Distribution figures the statistical marks draw: quantiles, confidence intervals, densities.
#ifndef PLOTAID_RENDER_MARKS_STATS_H
#define PLOTAID_RENDER_MARKS_STATS_H

#include <vector>

namespace plotaid::render {

// The finite values, sorted.
std::vector<double> sortedFinite(const std::vector<double>& values);
// The p-quantile (0..1) of sorted values, weighted between neighbours at p(n+1); NaN when empty.
double quantile(const std::vector<double>& sorted, double p);
double mean(const std::vector<double>& values);
// The sample standard deviation (n - 1); NaN below two values.
double standardDeviation(const std::vector<double>& values);
// Quantiles of the standard normal and of Student's t with `df` degrees of freedom.
double normalQuantile(double p);
double tQuantile(double p, double df);
// The two-sided critical value at a confidence level (0.95 and 0.05 both mean 95%); the normal
// one when there are no degrees of freedom to speak of.
double tCritical(double level, double df);

} // namespace plotaid::render

#endif
