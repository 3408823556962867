// The back planes and wire frame of 3-D coordinates, drawn behind the marks (the graph lists them
// first), with the value grid lines on the walls.
#include "render/Depth.h"
#include "render/Graph.h"

namespace plotaid::render {
namespace {

void measure(Plot&, const Element*) {}

using Corners = std::vector<Point>;

// The plane with the normal 0 (the wall at the start of x), 1 (the floor) or 2 (the back wall).
Corners planeOf(const Plot& plot, int normal) {
    if (normal == 0)
        return {at3(plot, 0, 0, 0), at3(plot, 0, 1, 0), at3(plot, 0, 1, 1), at3(plot, 0, 0, 1)};
    if (normal == 1)
        return {at3(plot, 0, 0, 0), at3(plot, 1, 0, 0), at3(plot, 1, 0, 1), at3(plot, 0, 0, 1)};
    return {at3(plot, 0, 0, 1), at3(plot, 1, 0, 1), at3(plot, 1, 1, 1), at3(plot, 0, 1, 1)};
}

void drawPlane(Plot& plot, const Element* guide) {
    if (plot.back.x == 0 && plot.back.y == 0)
        return;
    const int normal = static_cast<int>(number(guide, "normal", 2));
    if (normal < 0 || normal > 2)
        return;
    plot.canvas.polygon(planeOf(plot, normal), plot.styles.resolve(guide));
    if (normal == 1)
        return;
    // The value grid on the walls, where the flat grid (covered now) would have been.
    const auto dims = children(plot.coordinates, "dimension");
    const Element* major = dims.size() > 1 ? child(child(dims[1], "axis"), "majorTicks") : nullptr;
    const Element* grid = child(major, "gridline");
    if (grid == nullptr)
        return;
    const Style gs = plot.styles.resolve(grid, "style", plot.styles.chart());
    const Scale& sy = plot.dims[1];
    for (double v : niceTicks(sy.from, sy.to, number(major, "delta", 0), 5)) {
        const double f = sy.at(v);
        if (normal == 0)
            plot.canvas.line(at3(plot, 0, f, 0), at3(plot, 0, f, 1), gs);
        else
            plot.canvas.line(at3(plot, 0, f, 1), at3(plot, 1, f, 1), gs);
    }
}

void drawFrame(Plot& plot, const Element* guide) {
    if (plot.back.x == 0 && plot.back.y == 0)
        return;
    const Style s = plot.styles.resolve(guide);
    for (int normal = 0; normal < 3; ++normal) {
        Corners c = planeOf(plot, normal);
        c.push_back(c.front());
        plot.canvas.polyline(c, s);
    }
    if (flag(guide, "complete", false))
        for (double fx : {0.0, 1.0})
            for (double fy : {0.0, 1.0})
                plot.canvas.line(at3(plot, fx, fy, 0), at3(plot, fx, fy, 1), s);
}

const MarkRegistrar planes({"planeGuide", measure, drawPlane});
const MarkRegistrar frame({"frameGuide", measure, drawFrame});

} // namespace
} // namespace plotaid::render
