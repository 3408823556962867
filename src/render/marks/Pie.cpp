// Intervals in polar coordinates. Transposed, the values stack around the circle: a pie, or one
// ring per x category. Otherwise the x categories share the circle and the values set the radius.
#include "render/marks/Groups.h"

#include <algorithm>
#include <map>

namespace plotaid::render {
namespace {

bool applies(const Plot& plot, const Element*) {
    return plot.polar;
}

void measure(Plot&, const Element*) {}

struct Turn {
    double start = 0, sweep = 2 * M_PI; // radians clockwise from 12 o'clock; negative sweeps go back
};

Turn turnOf(const Plot& plot) {
    const Element* polar = child(plot.coordinates, "polarTransform");
    Turn t;
    t.start = number(polar, "startAngle", 0) * M_PI / 180;
    t.sweep = 2 * M_PI * std::clamp(number(polar, "cycles", 1), -1.0, 1.0);
    if (flag(polar, "counterClockwise", false))
        t.sweep = -t.sweep;
    if (!std::isfinite(t.start))
        t.start = 0;
    return t;
}

void wedge(Canvas& canvas, Point c, double inner, double outer, double a0, double a1, const Style& s) {
    if (a1 < a0)
        std::swap(a0, a1);
    if (inner <= 0) {
        canvas.wedge(c, outer, a0, a1, s);
        return;
    }
    // A ring segment: the outer arc forward, the inner arc back.
    std::vector<Point> pts;
    const int steps = std::clamp(static_cast<int>((a1 - a0) * 30), 2, 400);
    for (int i = 0; i <= steps; ++i) {
        const double a = a0 + (a1 - a0) * i / steps;
        pts.push_back({c.x + outer * std::sin(a), c.y - outer * std::cos(a)});
    }
    for (int i = steps; i >= 0; --i) {
        const double a = a0 + (a1 - a0) * i / steps;
        pts.push_back({c.x + inner * std::sin(a), c.y - inner * std::cos(a)});
    }
    canvas.polygon(pts, s);
}

// The value a wedge's label shows: the labeling's own statistic when it has one, else the wedge's.
double labelValue(const Element* labeling, const Summary& s, double total) {
    const Element* stat = child(labeling, "summaryStatistic");
    return stat ? statistic(static_cast<int>(number(stat, "method", 3)), s.values, total) : s.y;
}

void draw(Plot& plot, const Element* mark) {
    const Grouping g = group(plot, mark);
    const Scale& sx = plot.dims[0];
    const Element* labeling = child(mark, "labeling");
    const bool outside = labeling && flag(labeling, "connectingLines", false);
    const Point c{plot.area.x + plot.area.w / 2, plot.area.y + plot.area.h / 2};
    const double radius = std::min(plot.area.w, plot.area.h) / 2 * (outside ? 0.78 : 0.95);
    const Turn turn = turnOf(plot);
    std::map<std::size_t, double> sums, done;
    double rows = 0, most = 0;
    for (const Summary& s : g.summaries)
        if (std::isfinite(s.y) && s.y > 0) {
            sums[s.xIndex] += s.y;
            most = std::max(most, s.y);
            rows += static_cast<double>(s.values.size());
        }
    const Style labelStyle = plot.styles.resolve(labeling, "style", plot.styles.chart());
    const std::size_t slots = sx.categorical ? std::max<std::size_t>(1, sx.categories.size()) : 1;
    for (const Summary& s : g.summaries) {
        if (!std::isfinite(s.y) || s.y <= 0)
            continue;
        double a0, a1, inner = 0, outer = radius;
        if (plot.transposed) {
            const double sum = sums[s.xIndex];
            a0 = turn.start + turn.sweep * done[s.xIndex] / sum;
            a1 = turn.start + turn.sweep * (done[s.xIndex] += s.y) / sum;
            if (sx.categorical && slots > 1) {
                inner = radius * (sx.atCategory(s.xIndex) - sx.band() / 2);
                outer = radius * (sx.atCategory(s.xIndex) + sx.band() / 2);
            }
        } else {
            const double step = turn.sweep / static_cast<double>(slots);
            a0 = turn.start + step * static_cast<double>(s.xIndex);
            a1 = a0 + step;
            outer = radius * s.y / most;
        }
        wedge(plot.canvas, c, inner, outer, a0, a1, plot.rowStyle(mark, s.firstRow));
        if (labeling == nullptr)
            continue;
        const std::string text = formatNumber(labelValue(labeling, s, rows), child(labeling, "format"));
        const double mid = (a0 + a1) / 2, dx = std::sin(mid), dy = -std::cos(mid);
        if (outside) {
            const double r = outer * 1.08;
            plot.canvas.line({c.x + dx * outer * 0.95, c.y + dy * outer * 0.95}, {c.x + dx * r, c.y + dy * r},
                             labelStyle);
            plot.canvas.text(text, {c.x + dx * r * 1.02, c.y + dy * r * 1.02}, labelStyle, dx < 0 ? 1 : 0,
                             0.5);
        } else {
            const double r = (inner + outer) / 2 + (inner > 0 ? 0 : outer * 0.15);
            plot.canvas.text(text, {c.x + dx * r, c.y + dy * r}, labelStyle, 0.5, 0.5);
        }
    }
}

const MarkVariantRegistrar registrar({"interval", 10, applies, measure, draw, true});

} // namespace
} // namespace plotaid::render
