// Bars with depth: a front face with its top and side faces in darker shades, each z category set
// further back; drawn back to front, left to right, so nearer bars cover farther ones.
#include "render/Depth.h"
#include "render/marks/Groups.h"

#include <algorithm>
#include <sstream>

namespace plotaid::render {
namespace {

bool applies(const Plot& plot, const Element*) {
    return !plot.polar && isThreeD(plot.coordinates);
}

void measure(Plot& plot, const Element* mark) {
    for (const Summary& s : group(plot, mark).summaries) {
        plot.dims[1].include(s.y);
        if (!plot.dims[0].categorical)
            plot.dims[0].include(s.x);
    }
}

// The bar's depth as a share of its z slot: the style's "depth" (the last of its styles that says).
double depthOf(const Element* mark) {
    std::istringstream ids(attr(mark, "style"));
    Length depth{60, true};
    for (std::string id; ids >> id;)
        if (const Element* style = byId(mark, id); style && hasAttr(style, "depth"))
            parseLength(attr(style, "depth"), depth);
    const double f = depth.percent ? depth.value / 100 : depth.value;
    return std::isfinite(f) ? std::clamp(f, 0.05, 1.0) : 0.6;
}

struct Bar {
    const Summary* s;
    double zCentre, zBand;
};

void draw(Plot& plot, const Element* mark) {
    const Grouping g = group(plot, mark);
    const Scale &sx = plot.dims[0], &sy = plot.dims[1], &sz = plot.dims[2];
    const Column* z = plot.columnOf(mark, "z");
    const double share = depthOf(mark);
    std::vector<Bar> bars;
    for (const Summary& s : g.summaries) {
        if (!std::isfinite(s.y))
            continue;
        Bar b{&s, std::clamp(number(mark, "zLocation", 0.5), 0.0, 1.0), 1};
        if (z && sz.categorical && s.firstRow < z->text.size()) {
            const int i = sz.indexOf(z->text[s.firstRow]);
            if (i < 0)
                continue;
            b.zCentre = sz.atCategory(static_cast<std::size_t>(i));
            b.zBand = sz.band();
        }
        bars.push_back(b);
    }
    std::stable_sort(bars.begin(), bars.end(), [](const Bar& a, const Bar& b) {
        return a.zCentre != b.zCentre ? a.zCentre > b.zCentre : a.s->xIndex < b.s->xIndex;
    });
    const bool sideRight = plot.back.x >= 0, topUp = plot.back.y <= 0;
    for (const Bar& b : bars) {
        const Summary& s = *b.s;
        const Style style = plot.rowStyle(mark, s.firstRow);
        const double width =
            style.width && style.width->percent ? std::clamp(style.width->value / 100, 0.0, 1.0) : 0.6;
        // Clusters share the band only when z does not already set them apart.
        const Slot slot =
            z ? Slot{sx.categorical ? sx.atCategory(s.xIndex) : sx.at(s.x), sx.categorical ? sx.band() : 0.02}
              : slotOf(plot, g, s);
        const double x0 = slot.centre - slot.band * width / 2, x1 = slot.centre + slot.band * width / 2;
        const double z0 = b.zCentre - b.zBand * share / 2, z1 = b.zCentre + b.zBand * share / 2;
        const double y0 = sy.at(std::min(0.0, s.y)), y1 = sy.at(std::max(0.0, s.y));
        const double ySide = topUp ? y1 : y0, xSide = sideRight ? x1 : x0;
        plot.canvas.polygon({at3(plot, x0, ySide, z0), at3(plot, x1, ySide, z0), at3(plot, x1, ySide, z1),
                             at3(plot, x0, ySide, z1)},
                            shaded(style, 0.85));
        plot.canvas.polygon({at3(plot, xSide, y0, z0), at3(plot, xSide, y1, z0), at3(plot, xSide, y1, z1),
                             at3(plot, xSide, y0, z1)},
                            shaded(style, 0.65));
        plot.canvas.polygon(
            {at3(plot, x0, y0, z0), at3(plot, x1, y0, z0), at3(plot, x1, y1, z0), at3(plot, x0, y1, z0)},
            style);
    }
}

const MarkVariantRegistrar registrar({"interval", 30, applies, measure, draw, true});

} // namespace
} // namespace plotaid::render
