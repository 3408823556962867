// Bars: simple, clustered (the x dimension's cluster variable) and stacked (position modifier 3).
#include "render/marks/Groups.h"
#include "render/marks/Labels.h"

#include <map>

namespace plotaid::render {
namespace {

void measure(Plot& plot, const Element* mark) {
    const Grouping g = group(plot, mark);
    std::map<std::size_t, double> tops;
    for (const Summary& s : g.summaries) {
        if (stacked(mark))
            plot.dims[1].include(tops[s.xIndex] += s.y);
        else
            plot.dims[1].include(s.y);
        if (!plot.dims[0].categorical)
            plot.dims[0].include(s.x);
    }
}

void draw(Plot& plot, const Element* mark) {
    const Grouping g = group(plot, mark);
    const Scale& sx = plot.dims[0];
    const Scale& sy = plot.dims[1];
    const bool clustered = hasAttr(sx.dimension, "clusterVariable") && g.split != nullptr;
    std::map<std::size_t, double> base;
    for (const Summary& s : g.summaries) {
        if (!std::isfinite(s.y))
            continue;
        const Style style = plot.rowStyle(mark, s.firstRow);
        const double width = style.width && style.width->percent ? style.width->value / 100 : 0.6;
        double centre = sx.categorical ? sx.atCategory(s.xIndex) : sx.at(s.x);
        double band = sx.categorical ? sx.band() : 0.02;
        if (clustered) {
            band /= static_cast<double>(g.splits);
            centre += (static_cast<double>(s.splitIndex) - (g.splits - 1) / 2.0) * band;
        }
        const double half = band * width / 2;
        double from = 0, to = s.y;
        if (stacked(mark)) {
            from = base[s.xIndex];
            to = base[s.xIndex] += s.y;
        }
        const Point a = plot.at(centre - half, sy.at(from));
        const Point b = plot.at(centre + half, sy.at(to));
        plot.canvas.rect(
            Rect{std::min(a.x, b.x), std::min(a.y, b.y), std::fabs(b.x - a.x), std::fabs(b.y - a.y)}, style);
        drawLabels(plot, mark, s.rows, rowsIn(g), plot.at(centre, sy.at(from)), plot.at(centre, sy.at(to)));
    }
}

const MarkRegistrar registrar({"interval", measure, draw});

} // namespace
} // namespace plotaid::render
