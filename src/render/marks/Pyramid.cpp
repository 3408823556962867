// Population pyramids: bars reflected about zero, the split categories alternating sides (the
// first to the left), each category of x a band across both.
#include "render/marks/Groups.h"

#include <algorithm>

namespace plotaid::render {
namespace {

bool applies(const Plot& plot, const Element*) {
    return plot.reflected && !plot.polar;
}

// -1 for the split categories drawn reflected, 1 for the others.
double sideOf(const Plot& plot, std::size_t splitIndex) {
    const bool alternating = flag(child(plot.coordinates, "reflectionTransform"), "alternating", false);
    return !alternating || splitIndex % 2 == 0 ? -1 : 1;
}

void measure(Plot& plot, const Element* mark) {
    double most = 0;
    for (const Summary& s : group(plot, mark).summaries)
        if (std::isfinite(s.y))
            most = std::max(most, std::fabs(s.y));
    // Symmetric, so the centre line is the middle of the area and both sides compare.
    plot.dims[1].include(-most);
    plot.dims[1].include(most);
    plot.dims[1].mirrored = true;
}

void draw(Plot& plot, const Element* mark) {
    const Grouping g = group(plot, mark);
    const Scale &sx = plot.dims[0], &sy = plot.dims[1];
    for (const Summary& s : g.summaries) {
        if (!std::isfinite(s.y) || !sx.categorical)
            continue;
        const Style style = plot.rowStyle(mark, s.firstRow);
        const double width =
            style.width && style.width->percent ? std::clamp(style.width->value / 100, 0.0, 1.0) : 0.9;
        const double half = sx.band() * width / 2, centre = sx.atCategory(s.xIndex);
        const Point a = plot.at(centre - half, sy.at(0));
        const Point b = plot.at(centre + half, sy.at(sideOf(plot, s.splitIndex) * std::fabs(s.y)));
        plot.canvas.rect(
            Rect{std::min(a.x, b.x), std::min(a.y, b.y), std::fabs(b.x - a.x), std::fabs(b.y - a.y)}, style);
    }
}

const MarkVariantRegistrar registrar({"interval", 20, applies, measure, draw, true});

} // namespace
} // namespace plotaid::render
