// Error bars: an interval whose statistic is a range (the confidence interval of the mean, or the
// minimum to maximum), drawn as an I-beam per category and cluster.
#include "render/marks/Groups.h"
#include "render/marks/Stats.h"

#include <algorithm>

namespace plotaid::render {
namespace {

bool applies(const Plot& plot, const Element* mark) {
    const int method = methodOf(mark, 0);
    return !plot.polar && (method == 6 || method == 7 || child(mark, "regionStatistic") != nullptr);
}

struct Range {
    double lo = NAN, hi = NAN;
};

Range rangeOf(const Element* mark, const std::vector<double>& values) {
    const std::vector<double> v = sortedFinite(values);
    if (v.empty())
        return {};
    if (methodOf(mark, 7) == 6 && child(mark, "regionStatistic") == nullptr)
        return {v.front(), v.back()};
    const double m = mean(v);
    if (v.size() < 2)
        return {m, m};
    // Charts write the confidence level either as itself (0.95) or as its complement (0.05).
    double level = number(child(mark, "regionStatistic"), "alpha", 0.95);
    if (!(level > 0 && level < 1))
        level = 0.95;
    if (level < 0.5)
        level = 1 - level;
    const double n = static_cast<double>(v.size());
    const double half = tQuantile(0.5 + level / 2, n - 1) * standardDeviation(v) / std::sqrt(n);
    return {m - half, m + half};
}

void measure(Plot& plot, const Element* mark) {
    for (const Summary& s : group(plot, mark).summaries) {
        const Range r = rangeOf(mark, s.values);
        plot.dims[1].include(r.lo);
        plot.dims[1].include(r.hi);
        if (!plot.dims[0].categorical)
            plot.dims[0].include(s.x);
    }
}

void draw(Plot& plot, const Element* mark) {
    const Grouping g = group(plot, mark);
    const Scale& sy = plot.dims[1];
    for (const Summary& s : g.summaries) {
        const Range r = rangeOf(mark, s.values);
        if (!std::isfinite(r.lo) || !std::isfinite(r.hi))
            continue;
        Style style = plot.rowStyle(mark, s.firstRow);
        if (!style.color2 || style.color2->a == 0)
            style.color2 = style.color;
        const Slot slot = slotOf(plot, g, s);
        const double width =
            style.width && style.width->percent ? std::clamp(style.width->value / 100, 0.0, 1.0) : 0.3;
        const double half = slot.band * width / 2;
        plot.canvas.line(plot.at(slot.centre, sy.at(r.lo)), plot.at(slot.centre, sy.at(r.hi)), style);
        if (style.symbol.value_or("ibeam") == "ibeam")
            for (double end : {r.lo, r.hi})
                plot.canvas.line(plot.at(slot.centre - half, sy.at(end)),
                                 plot.at(slot.centre + half, sy.at(end)), style);
    }
}

const MarkVariantRegistrar registrar({"interval", 50, applies, measure, draw, false});

} // namespace
} // namespace plotaid::render
