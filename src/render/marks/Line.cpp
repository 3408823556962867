// Lines and areas: one path per category of the split variable (colour, dash or styleBy), through
// the summaries in x order. Missing values break the path unless the line interpolates over
// them. A line with a smooth statistic is a fit over its rows; with a region statistic, the
// band of that fit.
#include "render/marks/Groups.h"
#include "render/marks/Labels.h"
#include "render/marks/Smooth.h"
#include "render/marks/Stats.h"

#include <algorithm>
#include <map>

namespace plotaid::render {
namespace {

constexpr int kSamples = 80;
constexpr std::size_t kMaxSplits = 500;

bool interpolates(const Element* mark) {
    const std::string b = attr(mark, "breakRepresentation");
    return b == "2" || b == "interpolated";
}

// Markers are filled with the line's colour where they have no fill of their own.
Style markerOf(const Style& line) {
    Style m = line;
    if (!m.color || m.color->a == 0)
        m.color = m.color2;
    return m;
}

bool hasMarkers(const Style& s) {
    return s.symbol && !s.symbol->empty() && *s.symbol != "none";
}

// One path's summaries per split, in x order; a missing category of a categorical x is a null.
std::vector<std::vector<const Summary*>> paths(const Plot& plot, const Grouping& g) {
    std::vector<std::vector<const Summary*>> out(std::min(g.splits, kMaxSplits));
    const Scale& sx = plot.dims[0];
    if (sx.categorical) {
        for (auto& path : out)
            path.assign(sx.categories.size(), nullptr);
        for (const Summary& s : g.summaries)
            if (s.splitIndex < out.size() && s.xIndex < sx.categories.size())
                out[s.splitIndex][s.xIndex] = &s;
        return out;
    }
    for (const Summary& s : g.summaries)
        if (s.splitIndex < out.size())
            out[s.splitIndex].push_back(&s);
    for (auto& path : out)
        std::sort(path.begin(), path.end(), [](const Summary* a, const Summary* b) { return a->x < b->x; });
    return out;
}

// The points of a path; a missing value is a NaN point (a break) or, when the line interpolates,
// left out. Each point stands at its value above `below`, or at `below` alone without `atValue`.
std::vector<Point> pointsOf(const Plot& plot, const Grouping& g, const std::vector<const Summary*>& path,
                            bool interpolate, const std::vector<double>* below = nullptr,
                            bool atValue = true) {
    std::vector<Point> out;
    for (std::size_t i = 0; i < path.size(); ++i) {
        const Summary* s = path[i];
        if (s == nullptr || !std::isfinite(s->y)) {
            if (!interpolate)
                out.push_back({NAN, NAN});
            continue;
        }
        const double base = below && i < below->size() ? (*below)[i] : 0;
        out.push_back(plot.at(centreOf(plot, g, *s), plot.dims[1].at(atValue ? base + s->y : base)));
    }
    return out;
}

// Steps and splines between the points of an interpolation line.
std::vector<Point> shaped(const std::vector<Point>& p, int method) {
    if (p.size() < 2 || method < 12 || method > 15)
        return p;
    std::vector<Point> out;
    for (std::size_t i = 0; i + 1 < p.size(); ++i) {
        const Point a = p[i], b = p[i + 1];
        out.push_back(a);
        if (!std::isfinite(a.x + b.x + a.y + b.y))
            continue;
        if (method == 13) { // the point at the left end of its step
            out.push_back({b.x, a.y});
        } else if (method == 14) {
            out.push_back({a.x, b.y});
        } else if (method == 15) {
            out.push_back({(a.x + b.x) / 2, a.y});
            out.push_back({(a.x + b.x) / 2, b.y});
        } else { // Catmull-Rom through the neighbours
            const Point p0 = i > 0 && std::isfinite(p[i - 1].x + p[i - 1].y) ? p[i - 1] : a;
            const Point p3 = i + 2 < p.size() && std::isfinite(p[i + 2].x + p[i + 2].y) ? p[i + 2] : b;
            for (int k = 1; k < 12; ++k) {
                const double t = k / 12.0, t2 = t * t, t3 = t2 * t;
                auto c = [&](double v0, double v1, double v2, double v3) {
                    return 0.5 * (2 * v1 + (v2 - v0) * t + (2 * v0 - 5 * v1 + 4 * v2 - v3) * t2 +
                                  (3 * v1 - v0 - 3 * v2 + v3) * t3);
                };
                out.push_back({c(p0.x, a.x, b.x, p3.x), c(p0.y, a.y, b.y, p3.y)});
            }
        }
    }
    out.push_back(p.back());
    return out;
}

// The rows of a fit: finite x and y, per split category (a fit per subgroup) or all together.
struct FitRows {
    std::vector<double> x, y;
    std::size_t firstRow = 0;
    bool any = false;
};

std::vector<FitRows> fitRows(const Plot& plot, const Element* mark) {
    const Column* x = plot.columnOf(mark, "x");
    const Column* y = plot.columnOf(mark, "y");
    std::vector<FitRows> out;
    if (x == nullptr || y == nullptr || x->categorical)
        return out;
    std::string domain;
    const std::string splitVariable = splitVariableOf(plot, mark, &domain);
    const Column* split = plot.data.variable(splitVariable);
    std::vector<std::string> categories;
    if (split)
        categories = plot.data.categories(splitVariable, domain);
    out.resize(std::clamp<std::size_t>(categories.size(), 1, kMaxSplits));
    for (std::size_t row = 0; row < x->values.size() && row < y->values.size(); ++row) {
        if (!plot.rowShown(row) || !std::isfinite(x->values[row]) || !std::isfinite(y->values[row]))
            continue;
        std::size_t k = 0;
        if (split) {
            if (row >= split->text.size())
                continue;
            const auto it = std::find(categories.begin(), categories.end(), split->text[row]);
            if (it == categories.end() || static_cast<std::size_t>(it - categories.begin()) >= out.size())
                continue;
            k = static_cast<std::size_t>(it - categories.begin());
        }
        FitRows& f = out[k];
        if (!f.any)
            f.firstRow = row;
        f.any = true;
        f.x.push_back(x->values[row]);
        f.y.push_back(y->values[row]);
    }
    return out;
}

void drawFit(Plot& plot, const Element* mark) {
    const Element* smooth = child(mark, "smoothStatistic");
    const Element* region = child(mark, "regionStatistic");
    const Scale& sx = plot.dims[0];
    const Scale& sy = plot.dims[1];
    for (const FitRows& f : fitRows(plot, mark)) {
        if (!f.any)
            continue;
        const auto [lo, hi] = std::minmax_element(f.x.begin(), f.x.end());
        const int method = static_cast<int>(number(smooth, "method", 0));
        const int degree = region        ? static_cast<int>(number(region, "degree", 1))
                           : method == 6 ? static_cast<int>(number(smooth, "degree", 2))
                                         : 1;
        const PolyFit fit = fitPolynomial(f.x, f.y, degree);
        const double t =
            tCritical(number(region, "alpha", 0.95), static_cast<double>(f.x.size()) - degree - 1);
        const bool individual = flag(region, "predictIndividuals", false);
        std::vector<Point> upper, lower, curve;
        for (int k = 0; k <= kSamples; ++k) {
            const double xv = *lo + (*hi - *lo) * k / kSamples;
            const double fx = sx.at(xv);
            if (region) {
                const double w = fit.halfWidth(xv, t, individual);
                upper.push_back(plot.at(fx, sy.at(fit.at(xv) + w)));
                lower.push_back(plot.at(fx, sy.at(fit.at(xv) - w)));
            } else {
                const double yv =
                    method == 1 ? loessAt(f.x, f.y, xv, number(smooth, "proportion", 0.3)) : fit.at(xv);
                curve.push_back(plot.at(fx, sy.at(yv)));
            }
        }
        const Style style = lineStroke(plot.rowStyle(mark, f.firstRow));
        plot.canvas.pushClip(plot.area);
        plot.canvas.polyline(curve, style);
        plot.canvas.polyline(upper, style);
        plot.canvas.polyline(lower, style);
        plot.canvas.pop();
    }
}

bool isFit(const Element* mark) {
    const Element* smooth = child(mark, "smoothStatistic");
    const double method = number(smooth, "method", 0);
    return child(mark, "regionStatistic") != nullptr || (smooth && (method < 12 || method > 15));
}

void measure(Plot& plot, const Element* mark) {
    if (isFit(mark)) {
        for (const FitRows& f : fitRows(plot, mark))
            for (double v : f.x)
                plot.dims[0].include(v);
        return;
    }
    const Grouping g = group(plot, mark);
    std::map<std::size_t, double> tops;
    for (const Summary& s : g.summaries) {
        plot.dims[1].include(stacked(mark) ? tops[s.xIndex] += s.y : s.y);
        if (!plot.dims[0].categorical)
            plot.dims[0].include(s.x);
    }
}

void drawLine(Plot& plot, const Element* mark) {
    if (isFit(mark)) {
        drawFit(plot, mark);
        return;
    }
    const Grouping g = group(plot, mark);
    const bool interpolate = interpolates(mark);
    const int method = static_cast<int>(number(child(mark, "smoothStatistic"), "method", -1));
    const std::size_t total = rowsIn(g);
    for (const auto& path : paths(plot, g)) {
        const auto first = std::find_if(path.begin(), path.end(), [](const Summary* s) { return s; });
        if (first == path.end())
            continue;
        const Style style = lineStroke(plot.rowStyle(mark, (*first)->firstRow));
        const std::vector<Point> points = pointsOf(plot, g, path, interpolate);
        plot.canvas.polyline(shaped(points, method), style);
        if (hasMarkers(style))
            for (const Point& p : points)
                if (std::isfinite(p.x + p.y))
                    plot.canvas.symbol(p, markerOf(style));
        for (const Summary* s : path)
            if (s && std::isfinite(s->y)) {
                const Point p = plot.at(centreOf(plot, g, *s), plot.dims[1].at(s->y));
                drawLabels(plot, mark, s->rows, total, p, p);
            }
    }
}

// An area fills down to the zero line (clamped into the range), or to the area below it when stacked.
void drawArea(Plot& plot, const Element* mark) {
    const Grouping g = group(plot, mark);
    const Scale& sy = plot.dims[1];
    const bool interpolate = interpolates(mark);
    const double floor = std::clamp(0.0, std::min(sy.from, sy.to), std::max(sy.from, sy.to));
    std::map<double, double> stackedTops; // x -> top so far
    const auto key = [&](const Summary* s) {
        return plot.dims[0].categorical ? static_cast<double>(s->xIndex) : s->x;
    };
    for (const auto& path : paths(plot, g)) {
        const auto first = std::find_if(path.begin(), path.end(), [](const Summary* s) { return s; });
        if (first == path.end())
            continue;
        // A stacked area stands on the areas before it; another one on the floor.
        std::vector<double> below(path.size(), 0), ground(path.size(), floor);
        for (std::size_t i = 0; i < path.size(); ++i)
            if (path[i] && stacked(mark))
                below[i] = ground[i] = stackedTops[key(path[i])];
        const std::vector<Point> top = pointsOf(plot, g, path, interpolate, &below);
        const std::vector<Point> bottom = pointsOf(plot, g, path, interpolate, &ground, false);
        if (stacked(mark))
            for (std::size_t i = 0; i < path.size(); ++i)
                if (path[i] && std::isfinite(path[i]->y))
                    stackedTops[key(path[i])] = below[i] + path[i]->y;
        const Style style = plot.rowStyle(mark, (*first)->firstRow);
        // Each unbroken run is one polygon: its top forward, its floor back.
        std::size_t start = 0;
        for (std::size_t i = 0; i <= top.size(); ++i) {
            if (i < top.size() && std::isfinite(top[i].x + top[i].y))
                continue;
            if (i - start >= 2) {
                std::vector<Point> outline(top.begin() + static_cast<std::ptrdiff_t>(start),
                                           top.begin() + static_cast<std::ptrdiff_t>(i));
                for (std::size_t k = i; k-- > start;)
                    outline.push_back(bottom[k]);
                plot.canvas.polygon(outline, style, true, false);
            }
            start = i + 1;
        }
        plot.canvas.polyline(top, style);
    }
}

const MarkRegistrar lines({"line", measure, drawLine});
const MarkRegistrar areas({"area", measure, drawArea});

} // namespace
} // namespace plotaid::render
