// Histograms: an interval over a continuous x counting the rows in bins, the bins the chart's bin
// statistic gives; and the distribution line over one, a normal curve scaled to the counts.
#include "render/marks/Groups.h"
#include "render/marks/Stats.h"

#include <algorithm>

namespace plotaid::render {
namespace {

constexpr std::size_t kMaxBins = 1000;

struct Bins {
    double start = 0, width = 0;
    std::vector<double> counts;
    std::size_t total = 0;
};

std::vector<double> shownValues(const Plot& plot, const Column* x) {
    std::vector<double> out;
    for (std::size_t row = 0; x && row < x->values.size(); ++row)
        if (plot.rowShown(row) && std::isfinite(x->values[row]))
            out.push_back(x->values[row]);
    return out;
}

// Rounds a width to 1, 2 or 5 times a power of ten.
double niceWidth(double raw) {
    if (!(raw > 0) || !std::isfinite(raw))
        return 1;
    const double magnitude = std::pow(10, std::floor(std::log10(raw)));
    const double f = raw / magnitude;
    return (f < 1.5 ? 1 : f < 3 ? 2 : f < 7 ? 5 : 10) * magnitude;
}

Bins binsOf(const Plot& plot, const Element* mark) {
    Bins b;
    const std::vector<double> v = shownValues(plot, plot.columnOf(mark, "x"));
    if (v.empty())
        return b;
    const auto [lo, hi] = std::minmax_element(v.begin(), v.end());
    const double span = *hi - *lo;
    const Element* bin = child(mark, "binStatistic");
    const double count = number(bin, "binCount", 0);
    b.width = number(bin, "binWidth", 0);
    if (!(b.width > 0) || !std::isfinite(b.width)) {
        // Without a width: the count asked for, else Sturges' rule.
        const double k = count >= 1 ? std::min(count, static_cast<double>(kMaxBins))
                                    : std::ceil(std::log2(static_cast<double>(v.size()))) + 1;
        b.width = span > 0 ? (count >= 1 ? span / k : niceWidth(span / k)) : 1;
    }
    // A width far too small for the data is widened rather than allocating without bound.
    if (span / b.width > static_cast<double>(kMaxBins - 1))
        b.width = span / static_cast<double>(kMaxBins - 1);
    const double anchor = number(bin, "binStart", count >= 1 && !hasAttr(bin, "binWidth") ? *lo : NAN);
    const double origin = std::isfinite(anchor) ? anchor : 0;
    b.start = origin + std::floor((*lo - origin) / b.width) * b.width;
    // An anchor so far off that the arithmetic loses the data starts at the data.
    if (!std::isfinite(b.start) || b.start > *lo || *lo - b.start > b.width)
        b.start = *lo;
    const double n = std::floor((*hi - b.start) / b.width) + 1;
    const double last = std::isfinite(n) ? std::clamp(n, 1.0, static_cast<double>(kMaxBins)) : 1.0;
    b.counts.assign(static_cast<std::size_t>(last), 0);
    for (double d : v) {
        const double i = std::floor((d - b.start) / b.width);
        ++b.counts[static_cast<std::size_t>(std::isfinite(i) ? std::clamp(i, 0.0, last - 1) : 0.0)];
    }
    b.total = v.size();
    return b;
}

bool isHistogram(const Plot& plot, const Element* mark) {
    const Column* x = plot.columnOf(mark, "x");
    return !plot.polar && x && !x->categorical && !plot.dims[0].categorical &&
           (methodOf(mark, 0) == 10 || child(mark, "binStatistic") != nullptr);
}

void measure(Plot& plot, const Element* mark) {
    const Bins b = binsOf(plot, mark);
    if (b.counts.empty())
        return;
    plot.dims[0].include(b.start);
    plot.dims[0].include(b.start + b.width * static_cast<double>(b.counts.size()));
    plot.dims[1].include(*std::max_element(b.counts.begin(), b.counts.end()));
}

void draw(Plot& plot, const Element* mark) {
    const Bins b = binsOf(plot, mark);
    const Style style = plot.styles.resolve(mark);
    const double width =
        style.width && style.width->percent ? std::clamp(style.width->value / 100, 0.0, 1.0) : 1.0;
    const Scale &sx = plot.dims[0], &sy = plot.dims[1];
    for (std::size_t i = 0; i < b.counts.size(); ++i) {
        if (b.counts[i] <= 0)
            continue;
        const double left = b.start + b.width * static_cast<double>(i);
        const double inset = b.width * (1 - width) / 2;
        const Point p = plot.at(sx.at(left + inset), sy.at(0));
        const Point q = plot.at(sx.at(left + b.width - inset), sy.at(b.counts[i]));
        plot.canvas.rect(
            Rect{std::min(p.x, q.x), std::min(p.y, q.y), std::fabs(q.x - p.x), std::fabs(q.y - p.y)}, style);
    }
}

// The distribution line: mean and deviation as the chart states them, else the data's; the
// curve counts rows per bin of the histogram it lies over.
struct Curve {
    double mean = NAN, sd = NAN, scale = 0;
    double at(double x) const {
        const double z = (x - mean) / sd;
        return scale * std::exp(-z * z / 2) / (sd * std::sqrt(2 * M_PI));
    }
};

bool isDistribution(const Plot& plot, const Element* mark) {
    const Column* x = plot.columnOf(mark, "x");
    return x && !x->categorical && !plot.polar &&
           attr(child(mark, "distributionStatistic"), "distribution") == "normal";
}

Curve curveOf(const Plot& plot, const Element* mark) {
    Curve c;
    const Element* d = child(mark, "distributionStatistic");
    const std::vector<double> v = shownValues(plot, plot.columnOf(mark, "x"));
    c.mean = parseNumber(attr(d, "parameter"));
    c.sd = parseNumber(attr(d, "secondaryParameter"));
    if (!std::isfinite(c.mean))
        c.mean = mean(v);
    if (!(c.sd > 0))
        c.sd = standardDeviation(v);
    // The bins of the histogram on the same variable, when the graph has one.
    const std::string variable = attr(child(mark, "x"), "variable");
    double width = 0;
    for (const Element* other : children(plot.graph, "interval"))
        if (attr(child(other, "x"), "variable") == variable &&
            attr(other, "coordinates") == attr(mark, "coordinates") && isHistogram(plot, other)) {
            width = binsOf(plot, other).width;
            break;
        }
    if (!(width > 0)) {
        Bins own = binsOf(plot, mark);
        width = own.width;
    }
    c.scale = static_cast<double>(v.size()) * width;
    return c;
}

void measureCurve(Plot& plot, const Element* mark) {
    const Curve c = curveOf(plot, mark);
    if (std::isfinite(c.mean) && c.sd > 0)
        plot.dims[1].include(c.at(c.mean));
}

void drawCurve(Plot& plot, const Element* mark) {
    const Curve c = curveOf(plot, mark);
    if (!std::isfinite(c.mean) || !(c.sd > 0) || !(c.scale > 0))
        return;
    const Scale &sx = plot.dims[0], &sy = plot.dims[1];
    std::vector<Point> points;
    constexpr int kSteps = 200;
    for (int i = 0; i <= kSteps; ++i) {
        const double x = sx.from + (sx.to - sx.from) * i / kSteps;
        points.push_back(plot.at(sx.at(x), sy.at(c.at(x))));
    }
    plot.canvas.polyline(points, plot.styles.resolve(mark));
}

const MarkVariantRegistrar histogram({"interval", 40, isHistogram, measure, draw, true});
const MarkVariantRegistrar distribution({"line", 40, isDistribution, measureCurve, drawCurve, false});

} // namespace
} // namespace plotaid::render
