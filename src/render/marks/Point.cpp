// Points: a marker per row, or per group when the mark summarises (the mean points of an error
// bar chart), moved aside within the category like the bars of a cluster.
#include "render/marks/Groups.h"
#include "render/marks/Labels.h"

namespace plotaid::render {
namespace {

// The fraction along a scale of one row's value; NaN when the row has none there.
double fractionOf(const Scale& s, const Column* c, std::size_t row) {
    if (c == nullptr || row >= c->values.size())
        return NAN;
    if (s.categorical) {
        const int i = s.indexOf(c->text[row]);
        return i < 0 ? NAN : s.atCategory(static_cast<std::size_t>(i));
    }
    return std::isfinite(c->values[row]) ? s.at(c->values[row]) : NAN;
}

void measure(Plot& plot, const Element* mark) {
    if (child(mark, "summaryStatistic")) {
        for (const Summary& s : group(plot, mark).summaries) {
            plot.dims[1].include(s.y);
            if (!plot.dims[0].categorical)
                plot.dims[0].include(s.x);
        }
        return;
    }
    for (std::size_t d = 0; d < 2; ++d) {
        const Column* c = plot.columnOf(mark, d == 0 ? "x" : "y");
        if (c == nullptr || plot.dims[d].categorical)
            continue;
        for (std::size_t row = 0; row < c->values.size(); ++row)
            if (plot.rowShown(row))
                plot.dims[d].include(c->values[row]);
    }
}

void draw(Plot& plot, const Element* mark) {
    if (child(mark, "summaryStatistic")) {
        const Grouping g = group(plot, mark);
        const std::size_t total = rowsIn(g);
        for (const Summary& s : g.summaries) {
            if (!std::isfinite(s.y))
                continue;
            const Point p = plot.at(centreOf(plot, g, s), plot.dims[1].at(s.y));
            plot.canvas.symbol(p, plot.rowStyle(mark, s.firstRow));
            drawLabels(plot, mark, s.rows, total, p, p);
        }
        return;
    }
    const Column* x = plot.columnOf(mark, "x");
    const Column* y = plot.columnOf(mark, "y");
    if (x == nullptr || y == nullptr)
        return;
    std::size_t shown = 0;
    for (std::size_t row = 0; row < x->values.size(); ++row)
        shown += plot.rowShown(row) ? 1 : 0;
    for (std::size_t row = 0; row < x->values.size(); ++row) {
        const double fx = fractionOf(plot.dims[0], x, row), fy = fractionOf(plot.dims[1], y, row);
        if (!plot.rowShown(row) || !std::isfinite(fx) || !std::isfinite(fy))
            continue;
        const Point p = plot.at(fx, fy);
        plot.canvas.symbol(p, plot.rowStyle(mark, row));
        drawLabels(plot, mark, {row}, shown, p, p);
    }
}

const MarkRegistrar registrar({"point", measure, draw});

} // namespace
} // namespace plotaid::render
