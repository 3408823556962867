#include "render/Graph.h"

#include "render/Depth.h"
#include "render/Facets.h"

#include <algorithm>
#include <cmath>

namespace plotaid::render {

namespace {

constexpr std::size_t kMaxTicks = 200;

struct AxisParts {
    const Element* axis = nullptr;
    const Element* major = nullptr;
    const Element* minor = nullptr;
};

AxisParts partsOf(const Element* dimension) {
    AxisParts p;
    p.axis = child(dimension, "axis");
    p.major = child(p.axis, "majorTicks");
    p.minor = child(p.axis, "minorTicks");
    return p;
}

// A major tick: where it lies (fraction) and its label.
struct Tick {
    double at;
    std::string label;
};

// `count` is about how many ticks the axis has room for.
std::vector<Tick> ticksOf(const Scale& s, const AxisParts& p, int count) {
    std::vector<Tick> out;
    if (s.categorical) {
        for (std::size_t i = 0; i < s.categories.size() && i < kMaxTicks; ++i)
            out.push_back({s.atCategory(i), s.categories[i]});
        return out;
    }
    for (double v : niceTicks(s.from, s.to, number(p.major, "delta", 0), count))
        out.push_back({s.at(v), formatNumber(s.mirrored ? std::fabs(v) : v, child(p.major, "format"))});
    return out;
}

double lengthOf(const Element* ticks, double unit, double fallback) {
    return number(ticks, "length", fallback) * unit;
}

} // namespace

std::vector<double> niceTicks(double lo, double hi, double delta, int count) {
    std::vector<double> out;
    if (!(hi > lo) || !std::isfinite(lo) || !std::isfinite(hi))
        return out;
    double step = delta;
    if (!(step > 0) || (hi - lo) / step > kMaxTicks) {
        const double raw = (hi - lo) / std::max(count, 1);
        const double magnitude = std::pow(10, std::floor(std::log10(raw)));
        const double f = raw / magnitude;
        step = (f < 1.5 ? 1 : f < 3 ? 2 : f < 7 ? 5 : 10) * magnitude;
    }
    const double first = std::ceil(lo / step - 1e-9) * step;
    for (double v = first; v <= hi + step * 1e-9 && out.size() < kMaxTicks; v += step)
        out.push_back(std::fabs(v) < step * 1e-9 ? 0 : v);
    return out;
}

std::vector<const Element*> marksOf(const Element* graph, const Element* coordinates, bool firstCoordinates) {
    std::vector<const Element*> out;
    const std::string id = attr(coordinates, "id");
    for (const Element* e : children(graph)) {
        if (markKind(nameOf(e)) == nullptr)
            continue;
        const std::string uses = attr(e, "coordinates");
        if (uses == id || (uses.empty() && firstCoordinates))
            out.push_back(e);
    }
    return out;
}

namespace {

// One set of coordinates measured but not yet drawn: its scales, ticks and the room its axes need
// on each side of the data area.
struct Prepared {
    Plot plot;
    std::vector<const Element*> dimensions, marks;
    std::vector<std::vector<Tick>> ticks = std::vector<std::vector<Tick>>(2);
    std::vector<AxisParts> parts = std::vector<AxisParts>(2);
    std::vector<Style> labelStyles = std::vector<Style>(2);
    double leftRoom = 0, bottomRoom = 0, rightRoom = 0, topRoom = 0;
};

Prepared prepare(const Page& page, const Element* graph, const Element* coordinates, const Rect& cell,
                 const std::vector<bool>& rowFilter, bool axes, int index) {
    Canvas& canvas = page.canvas;
    const double unit = canvas.unit();
    Prepared prepared{Plot{canvas,
                           page.styles,
                           page.data,
                           graph,
                           coordinates,
                           cell,
                           {},
                           false,
                           false,
                           false,
                           0,
                           rowFilter,
                           {},
                           {}},
                      children(coordinates, "dimension"), marksOf(graph, coordinates, index == 0)};
    Plot& plot = prepared.plot;
    plot.transposed = child(coordinates, "transposeTransform") != nullptr;
    plot.polar = child(coordinates, "polarTransform") != nullptr;
    plot.reflected = child(coordinates, "reflectionTransform") != nullptr;
    if (page.cell)
        page.cell->enter(plot);
    const auto& dimensions = prepared.dimensions;
    const auto& marks = prepared.marks;
    // Categorical dimensions take their categories from the domain or from the first mark
    // variable in that role.
    static const char* const kRoles[] = {"x", "y", "z"};
    bool bars = false;
    for (std::size_t d = 0; d < 3; ++d) {
        Scale& s = plot.dims[d];
        s.dimension = d < dimensions.size() ? dimensions[d] : nullptr;
        Length margin;
        if (parseLength(attr(s.dimension, "lowerMargin"), margin))
            s.lowerMargin = std::clamp(margin.value / 100, 0.0, 0.45);
        if (parseLength(attr(s.dimension, "upperMargin"), margin))
            s.upperMargin = std::clamp(margin.value / 100, 0.0, 0.45);
        std::string variable;
        for (const Element* m : marks)
            if (const Element* r = child(m, kRoles[d]); r && hasAttr(r, "variable")) {
                variable = attr(r, "variable");
                break;
            }
        const Column* c = page.data.variable(variable);
        const Element* domain = byId(coordinates, attr(s.dimension, "domain"));
        if ((c && c->categorical) || nameOf(domain) == "categoricalDomain") {
            s.categorical = true;
            s.categories = page.data.categories(variable, attr(s.dimension, "domain"));
        }
    }
    for (const Element* m : marks) {
        bars = bars || startsAtZero(plot, m);
        measureMark(plot, m);
    }
    if (page.cell)
        page.cell->share(plot);
    for (std::size_t d = 0; d < 3; ++d)
        plot.dims[d].settle(bars && d == 1);

    // Room for the axes: tick labels and the axis label outside the data area.
    const bool xOnLeft = plot.transposed;
    auto& ticks = prepared.ticks;
    auto& parts = prepared.parts;
    auto& labelStyles = prepared.labelStyles;
    if (!plot.polar)
        for (std::size_t d = 0; d < 2 && d < dimensions.size(); ++d) {
            parts[d] = partsOf(dimensions[d]);
            // A narrow panel gets fewer ticks, so that their labels do not run into each other.
            const bool along = (d == 1) != plot.transposed;
            const double fits = (along ? cell.h : cell.w) / (unit * (along ? 30 : 60));
            ticks[d] = ticksOf(plot.dims[d], parts[d], static_cast<int>(std::clamp(fits, 2.0, 5.0)));
            const Style axisStyle = page.styles.resolve(parts[d].axis, "style", page.styles.chart());
            if (!axes || !axisStyle.visible.value_or(true))
                continue;
            labelStyles[d] = page.styles.resolve(parts[d].major, "style", page.styles.chart());
            const bool vertical = (d == 1) != xOnLeft;
            const bool opposite = flag(parts[d].axis, "opposite", false);
            double room = lengthOf(parts[d].major, unit, 3) + 2 * unit;
            for (const Tick& t : ticks[d]) {
                const TextSize size = canvas.measure(t.label, labelStyles[d]);
                room = std::max(room,
                                lengthOf(parts[d].major, unit, 3) + 2 * unit + (vertical ? size.w : size.h));
            }
            const Element* label = child(parts[d].axis, "label");
            const Style labelStyle = page.styles.resolve(label, "style", page.styles.chart());
            if (label && labelStyle.visible.value_or(true))
                room += canvas.measure(textOf(label), labelStyle).h + 2 * unit;
            double& side = vertical ? (opposite ? prepared.rightRoom : prepared.leftRoom)
                                    : (opposite ? prepared.topRoom : prepared.bottomRoom);
            side = std::max(side, room);
        }
    return prepared;
}

Rect areaWithin(const Rect& cell, double left, double right, double top, double bottom) {
    return Rect{cell.x + left, cell.y + top, std::max(1.0, cell.w - left - right),
                std::max(1.0, cell.h - top - bottom)};
}

// Grid lines under the marks.
void drawGrid(const Page& page, Prepared& p) {
    Canvas& canvas = page.canvas;
    Plot& plot = p.plot;
    const auto& dimensions = p.dimensions;
    const auto& parts = p.parts;
    const auto& ticks = p.ticks;
    if (!plot.polar)
        for (std::size_t d = 0; d < 2 && d < dimensions.size(); ++d) {
            const Element* grid = child(parts[d].major, "gridline");
            if (grid == nullptr)
                continue;
            Style gs = page.styles.resolve(grid, "style", page.styles.chart());
            for (const Tick& t : ticks[d]) {
                const Point a = d == 0 ? plot.at(t.at, 0) : plot.at(0, t.at);
                const Point b = d == 0 ? plot.at(t.at, 1) : plot.at(1, t.at);
                canvas.line(a, b, gs);
            }
        }
}

void drawMarks(Prepared& p) {
    Canvas& canvas = p.plot.canvas;
    Plot& plot = p.plot;
    // Reference rectangles lie behind the data unless they ask to be in front.
    std::vector<const Element*> marks = p.marks;
    std::stable_partition(marks.begin(), marks.end(), [](const Element* m) {
        return nameOf(m) == "rectangleGuide" && number(m, "zOrder", 0) <= 0;
    });
    canvas.pushClip(Rect{plot.area.x - 0.5 * plot.area.w, plot.area.y - 0.5 * plot.area.h, plot.area.w * 2,
                         plot.area.h * 2});
    for (const Element* m : marks)
        drawMark(plot, m);
    canvas.pop();
}

void drawAxes(const Page& page, Prepared& set) {
    if (set.plot.polar)
        return;
    Canvas& canvas = page.canvas;
    Plot& plot = set.plot;
    const auto& dimensions = set.dimensions;
    const double unit = canvas.unit();
    const bool xOnLeft = plot.transposed;
    const auto& parts = set.parts;
    const auto& ticks = set.ticks;
    const auto& labelStyles = set.labelStyles;
    for (std::size_t d = 0; d < 2 && d < dimensions.size(); ++d) {
        const AxisParts& p = parts[d];
        Style axisStyle = page.styles.resolve(p.axis, "style", page.styles.chart());
        if (!axisStyle.visible.value_or(true))
            continue;
        const bool vertical = (d == 1) != xOnLeft;
        const bool opposite = flag(p.axis, "opposite", false);
        if (page.cell && !page.cell->paints(vertical, opposite))
            continue;
        // The axis line runs along the data area's edge.
        const Point a = vertical ? Point{opposite ? plot.area.right() : plot.area.x, plot.area.bottom()}
                                 : Point{plot.area.x, opposite ? plot.area.y : plot.area.bottom()};
        const Point b = vertical ? Point{a.x, plot.area.y} : Point{plot.area.right(), a.y};
        canvas.line(a, b, axisStyle);
        const double outward = opposite ? 1 : -1; // right/up is positive
        const Style markStyle = page.styles.resolve(p.major, "markStyle", axisStyle);
        const double len = lengthOf(p.major, unit, 3);
        const bool inside = attr(p.major, "position") == "inside";
        double far = 0;
        for (const Tick& t : ticks[d]) {
            const double along =
                vertical ? plot.area.bottom() - t.at * plot.area.h : plot.area.x + t.at * plot.area.w;
            const double sign = inside ? -outward : outward;
            Point from = vertical ? Point{a.x, along} : Point{along, a.y};
            Point to = vertical ? Point{a.x + sign * len, along} : Point{along, a.y - sign * len};
            if (p.major)
                canvas.line(from, to, markStyle);
            const double gap = (inside ? 0 : len) + 2 * unit;
            const double angle = labelStyles[d].labelAngle.value_or(number(p.major, "labelAngle", 0));
            const TextSize size = canvas.measure(t.label, labelStyles[d]);
            if (vertical) {
                canvas.text(t.label, {a.x + outward * gap, along}, labelStyles[d], opposite ? 0 : 1, 0.5,
                            angle);
                far = std::max(far, gap + size.w);
            } else {
                canvas.text(t.label, {along, a.y - outward * gap}, labelStyles[d], angle ? 1 : 0.5,
                            opposite ? 1 : 0, angle);
                far = std::max(far, gap + size.h);
            }
        }
        // Minor ticks between the major ones of a continuous axis.
        const int minor = static_cast<int>(std::clamp(number(p.minor, "number", 0), 0.0, 20.0));
        if (p.minor && minor > 0 && !plot.dims[d].categorical && ticks[d].size() > 1) {
            const double step = (ticks[d][1].at - ticks[d][0].at) / (minor + 1);
            const double mlen = lengthOf(p.minor, unit, 2);
            const bool mInside = attr(p.minor, "position") == "inside";
            const Style ms = page.styles.resolve(p.minor, "markStyle", axisStyle);
            for (double f = ticks[d][0].at - step * minor; f <= 1 + 1e-9; f += step) {
                if (f < -1e-9)
                    continue;
                const double along =
                    vertical ? plot.area.bottom() - f * plot.area.h : plot.area.x + f * plot.area.w;
                const double sign = mInside ? -outward : outward;
                canvas.line(vertical ? Point{a.x, along} : Point{along, a.y},
                            vertical ? Point{a.x + sign * mlen, along} : Point{along, a.y - sign * mlen}, ms);
            }
        }
        const Element* label = child(p.axis, "label");
        const Style ls = page.styles.resolve(label, "style", page.styles.chart());
        const std::string text = textOf(label);
        const Rect span = page.cell ? page.cell->titleSpan(vertical) : plot.area;
        if (label && !text.empty() && span.w > 0) {
            if (vertical)
                canvas.text(text, {a.x + outward * (far + 2 * unit), span.y + span.h / 2}, ls, 0.5,
                            opposite ? 0 : 1, 90);
            else
                canvas.text(text, {span.x + span.w / 2, a.y - outward * (far + 2 * unit)}, ls, 0.5,
                            opposite ? 1 : 0);
        }
    }
}

} // namespace

void drawCoordinates(const Page& page, const Element* graph, const Element* coordinates, const Rect& cell,
                     const std::vector<bool>& rowFilter, bool axes, int index) {
    Prepared p = prepare(page, graph, coordinates, cell, rowFilter, axes, index);
    // A panel's first pass only measures.
    if (page.cell && !page.cell->fit(p.leftRoom, p.bottomRoom, p.rightRoom, p.topRoom))
        return;
    p.plot.area = areaWithin(cell, p.leftRoom, p.rightRoom, p.topRoom, p.bottomRoom);
    setUpDepth(p.plot);
    drawGrid(page, p);
    drawMarks(p);
    if (axes)
        drawAxes(page, p);
}

void drawCoordinateSets(const Page& page, const Element* graph, const Rect& cell,
                        const std::vector<bool>& rowFilter, bool axes) {
    const auto coordinates = children(graph, "coordinates");
    std::vector<Prepared> sets;
    double left = 0, right = 0, top = 0, bottom = 0;
    for (std::size_t i = 0; i < coordinates.size() && i < 8; ++i) {
        sets.push_back(prepare(page, graph, coordinates[i], cell, rowFilter, axes, static_cast<int>(i)));
        left = std::max(left, sets.back().leftRoom);
        right = std::max(right, sets.back().rightRoom);
        top = std::max(top, sets.back().topRoom);
        bottom = std::max(bottom, sets.back().bottomRoom);
    }
    // Every set shares the one data area, so a second y axis measures the same bars and lines.
    for (Prepared& p : sets) {
        p.plot.area = areaWithin(cell, left, right, top, bottom);
        setUpDepth(p.plot);
    }
    for (Prepared& p : sets)
        drawGrid(page, p);
    for (Prepared& p : sets)
        drawMarks(p);
    if (axes)
        for (Prepared& p : sets)
            drawAxes(page, p);
}

void drawGraph(const Page& page, const Element* graph, const Rect& frame) {
    Canvas& canvas = page.canvas;
    const Style graphStyle = page.styles.resolve(graph, "style", page.styles.chart());
    if (!graphStyle.visible.value_or(true))
        return;
    const double pad = 4 * canvas.unit();
    const Rect inner{frame.x + pad, frame.y + pad, std::max(1.0, frame.w - 2 * pad),
                     std::max(1.0, frame.h - 2 * pad)};
    canvas.rect(frame, graphStyle, true, false);
    if (drawFacets(page, graph, inner))
        return;
    drawCoordinateSets(page, graph, inner, {}, true);
}

} // namespace plotaid::render
