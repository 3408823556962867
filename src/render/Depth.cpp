#include "render/Depth.h"

#include <algorithm>

namespace plotaid::render {

bool isThreeD(const Element* coordinates) {
    return child(coordinates, "rectangularTransform") != nullptr ||
           child(coordinates, "obliqueTransform") != nullptr;
}

void setUpDepth(Plot& plot) {
    if (plot.polar || !isThreeD(plot.coordinates))
        return;
    const double room = std::min(plot.area.w, plot.area.h) * 0.45;
    double dx, dy;
    if (const Element* r = child(plot.coordinates, "rectangularTransform")) {
        // Turning the view by theta shows the side, tilting it by phi the top.
        const double zscale = std::clamp(number(r, "zscale", 1), 0.1, 1.0);
        dx = std::sin(number(r, "theta", 30) * M_PI / 180) * room * zscale;
        dy = std::sin(number(r, "phi", 20) * M_PI / 180) * room * zscale;
    } else {
        const Element* o = child(plot.coordinates, "obliqueTransform");
        const double length = std::clamp(number(o, "foreShortening", 0.5), 0.1, 1.0) * room;
        const double theta = number(o, "theta", 45) * M_PI / 180;
        dx = std::cos(theta) * length;
        dy = std::sin(theta) * length;
    }
    if (!std::isfinite(dx) || !std::isfinite(dy))
        return;
    plot.back = {dx, -dy};
    const double w = std::max(1.0, plot.area.w - std::fabs(dx)),
                 h = std::max(1.0, plot.area.h - std::fabs(dy));
    plot.area = Rect{plot.area.x + (dx < 0 ? plot.area.w - w : 0),
                     plot.area.y + (dy > 0 ? plot.area.h - h : 0), w, h};
}

Point at3(const Plot& plot, double fx, double fy, double fz) {
    const Point p = plot.at(fx, fy);
    return {p.x + fz * plot.back.x, p.y + fz * plot.back.y};
}

Style shaded(const Style& s, double factor) {
    Style out = s;
    if (out.color)
        out.color = Rgba{out.color->r * factor, out.color->g * factor, out.color->b * factor, out.color->a};
    return out;
}

} // namespace plotaid::render
