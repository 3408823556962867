// Guides a chart or template adds over the data: reference and origin lines (lineGuide), function
// curves (functionGuide), reference rectangles and anchored annotations (pointGuide), each with
// its optional framed label.
#include "render/marks/Groups.h"
#include "render/marks/Labels.h"

#include <algorithm>
#include <cctype>
#include <cstdlib>

namespace plotaid::render {
namespace {

constexpr int kMaxSegments = 1000;
constexpr int kMaxDepth = 64;

// y as a function of x, read from text like "2*x", "y = 0.5*x^2 + 3" or "sqrt(x)".
class Formula {
public:
    explicit Formula(const std::string& text)
        : text_(text.substr(text.find('=') == std::string::npos ? 0 : text.find('=') + 1)) {}
    // NaN when the text is not a formula this reads.
    double at(double x) {
        x_ = x;
        pos_ = 0;
        depth_ = 0;
        ok_ = true;
        const double v = sum();
        skip();
        return ok_ && pos_ == text_.size() ? v : NAN;
    }

private:
    void skip() {
        while (pos_ < text_.size() && std::isspace(static_cast<unsigned char>(text_[pos_])))
            ++pos_;
    }
    bool take(char c) {
        skip();
        if (pos_ < text_.size() && text_[pos_] == c) {
            ++pos_;
            return true;
        }
        return false;
    }
    double sum() {
        double v = product();
        for (;;) {
            if (take('+'))
                v += product();
            else if (take('-'))
                v -= product();
            else
                return v;
        }
    }
    double product() {
        double v = power();
        for (;;) {
            if (take('*'))
                v *= power();
            else if (take('/'))
                v /= power();
            else
                return v;
        }
    }
    double power() {
        const double v = unary();
        if (!take('^'))
            return v;
        // "x^x^x..." nests without brackets, so it counts towards the depth as well.
        if (++depth_ > kMaxDepth) {
            ok_ = false;
            return NAN;
        }
        const double e = power();
        --depth_;
        return std::pow(v, e);
    }
    double unary() {
        if (++depth_ > kMaxDepth) {
            ok_ = false;
            return NAN;
        }
        double v;
        if (take('-'))
            v = -unary();
        else if (take('+'))
            v = unary();
        else
            v = primary();
        --depth_;
        return v;
    }
    double primary() {
        skip();
        if (take('(')) {
            const double v = sum();
            ok_ = take(')') && ok_;
            return v;
        }
        const std::size_t start = pos_;
        if (pos_ < text_.size() &&
            (std::isdigit(static_cast<unsigned char>(text_[pos_])) || text_[pos_] == '.')) {
            char* end = nullptr;
            const double v = std::strtod(text_.c_str() + start, &end);
            pos_ = static_cast<std::size_t>(end - text_.c_str());
            return v;
        }
        while (pos_ < text_.size() && std::isalnum(static_cast<unsigned char>(text_[pos_])))
            ++pos_;
        const std::string name = text_.substr(start, pos_ - start);
        if (name == "x")
            return x_;
        if (name == "pi")
            return M_PI;
        if (name == "e")
            return M_E;
        static const struct {
            const char* name;
            double (*f)(double);
        } kFunctions[] = {{"sin", std::sin},     {"cos", std::cos},   {"tan", std::tan},
                          {"exp", std::exp},     {"log", std::log},   {"ln", std::log},
                          {"log10", std::log10}, {"sqrt", std::sqrt}, {"abs", std::fabs}};
        for (const auto& f : kFunctions)
            if (name == f.name && take('(')) {
                const double v = f.f(sum());
                ok_ = take(')') && ok_;
                return v;
            }
        ok_ = false;
        return NAN;
    }

    std::string text_;
    std::size_t pos_ = 0;
    int depth_ = 0;
    double x_ = 0;
    bool ok_ = true;
};

// A guide's value along dimension d as a fraction: a category, a number, or a statistic word
// ("mean", "median", "minimum", "maximum") over what the data marks of these coordinates draw.
double fractionOf(const Plot& plot, std::size_t d, const std::string& value) {
    const Scale& s = plot.dims[d];
    if (value.empty())
        return NAN;
    if (s.categorical) {
        const int i = s.indexOf(value);
        return i < 0 ? NAN : s.atCategory(static_cast<std::size_t>(i));
    }
    double v = parseNumber(value);
    if (std::isnan(v)) {
        std::vector<double> drawn;
        const std::string id = attr(plot.coordinates, "id");
        for (const Element* m : children(plot.graph))
            for (const char* kind : {"interval", "line", "area", "point"})
                if (nameOf(m) == kind && (attr(m, "coordinates").empty() || attr(m, "coordinates") == id))
                    for (const Summary& g : group(plot, m).summaries)
                        drawn.push_back(d == 0 ? g.x : g.y);
        drawn.erase(std::remove_if(drawn.begin(), drawn.end(), [](double a) { return !std::isfinite(a); }),
                    drawn.end());
        if (drawn.empty())
            return NAN;
        const auto [lo, hi] = std::minmax_element(drawn.begin(), drawn.end());
        v = value == "mean"      ? statistic(2, drawn, 0)
            : value == "median"  ? statistic(5, drawn, 0)
            : value == "minimum" ? *lo
            : value == "maximum" ? *hi
                                 : NAN;
    }
    return std::isfinite(v) ? s.at(v) : NAN;
}

// A category guide spans its band; a number is a line.
void spanOf(const Plot& plot, std::size_t d, const std::string& a, const std::string& b, double& from,
            double& to) {
    const Scale& s = plot.dims[d];
    const double half = s.categorical ? s.band() / 2 : 0;
    from = a.empty() ? 0 : fractionOf(plot, d, a) - half;
    to = b.empty() ? 1 : fractionOf(plot, d, b) + half;
    if (from > to)
        std::swap(from, to);
}

// Only the guide's own styles: the chart's black outline would hide the colour a template gives.
// A guide no style colours is drawn in black.
Style guideStyle(const Plot& plot, const Element* guide) {
    Style s = plot.styles.resolve(guide, "style");
    if (!s.color && !s.color2)
        s.color2 = Rgba{0, 0, 0, 1};
    return s;
}

// The guide's label on the span from a to b (device points, b the far end), placed as its style
// says; `vertical` when the guide runs up the page.
void drawGuideLabel(const Plot& plot, const Element* guide, Point a, Point b, bool vertical) {
    const Element* label = child(guide, "label");
    if (label == nullptr || !std::isfinite(a.x + a.y + b.x + b.y))
        return;
    const Style style = textStyleOf(plot, label);
    const LabelPlace place = labelPlaceOf(plot, label);
    const double gap = 2 * plot.canvas.unit();
    const int along = vertical ? place.vertical : place.horizontal;
    const int across = vertical ? place.horizontal : place.vertical;
    // Along the guide: its far end (positive), its near end (negative) or its middle.
    const double t = along == 3 ? 0 : along == 1 ? 0.5 : 1;
    Point at{a.x + (b.x - a.x) * t, a.y + (b.y - a.y) * t};
    double ax = 0.5, ay = 0.5;
    const double inward = t == 1 ? -1 : t == 0 ? 1 : 0; // device y grows downwards
    if (vertical) {
        ay = t == 1 ? 0 : t == 0 ? 1 : 0.5;
        at.y -= inward * gap;
    } else {
        ax = t == 1 ? 1 : t == 0 ? 0 : 0.5;
        at.x += inward * gap;
    }
    // Across it: beside it (positive right/up, negative left/down) or on it.
    if (across == 2 || across == 3) {
        const double side = across == 2 ? 1 : -1;
        if (vertical) {
            at.x += side * gap;
            ax = across == 2 ? 0 : 1;
        } else {
            at.y -= side * gap;
            ay = across == 2 ? 1 : 0;
        }
    }
    framedText(plot.canvas, textOf(label), at, style, plot.styles.resolve(label, "textFrameStyle"), ax, ay);
}

void measureLine(Plot& plot, const Element* guide) {
    for (std::size_t d = 0; d < 2; ++d)
        plot.dims[d].include(parseNumber(attr(guide, d == 0 ? "x" : "y")));
}

void drawLine(Plot& plot, const Element* guide) {
    const Style style = guideStyle(plot, guide);
    plot.canvas.pushClip(plot.area);
    for (std::size_t d = 0; d < 2; ++d) {
        const double f = fractionOf(plot, d, attr(guide, d == 0 ? "x" : "y"));
        if (!std::isfinite(f))
            continue;
        const Point a = d == 0 ? plot.at(f, 0) : plot.at(0, f);
        const Point b = d == 0 ? plot.at(f, 1) : plot.at(1, f);
        plot.canvas.line(a, b, lineStroke(style));
        // Where x runs up the page, a line at an x value lies across it.
        drawGuideLabel(plot, guide, a, b, (d == 0) != plot.transposed);
    }
    plot.canvas.pop();
}

void drawFunction(Plot& plot, const Element* guide) {
    Formula formula(attr(guide, "value"));
    const Scale& sx = plot.dims[0];
    if (sx.categorical)
        return;
    // Over the range of the data, not the margins around it.
    const double lo = std::isfinite(sx.lo) ? sx.lo : sx.from, hi = std::isfinite(sx.hi) ? sx.hi : sx.to;
    const int segments =
        static_cast<int>(std::clamp(number(guide, "segments", 100), 1.0, double(kMaxSegments)));
    std::vector<Point> points;
    for (int k = 0; k <= segments; ++k) {
        const double x = lo + (hi - lo) * k / segments;
        const double y = formula.at(x);
        points.push_back(std::isfinite(y) ? plot.at(sx.at(x), plot.dims[1].at(y)) : Point{NAN, NAN});
    }
    plot.canvas.pushClip(plot.area);
    plot.canvas.polyline(points, lineStroke(guideStyle(plot, guide)));
    std::vector<Point> drawn;
    std::copy_if(points.begin(), points.end(), std::back_inserter(drawn), [&](const Point& p) {
        return std::isfinite(p.x + p.y) && p.y >= plot.area.y && p.y <= plot.area.bottom();
    });
    if (!drawn.empty())
        drawGuideLabel(plot, guide, drawn.front(), drawn.back(), false);
    plot.canvas.pop();
}

void measureRectangle(Plot& plot, const Element* guide) {
    for (const char* a : {"x1", "x2"})
        plot.dims[0].include(parseNumber(attr(guide, a)));
    for (const char* a : {"y1", "y2"})
        plot.dims[1].include(parseNumber(attr(guide, a)));
}

void drawRectangle(Plot& plot, const Element* guide) {
    double x0, x1, y0, y1;
    spanOf(plot, 0, attr(guide, "x1"), attr(guide, "x2"), x0, x1);
    spanOf(plot, 1, attr(guide, "y1"), attr(guide, "y2"), y0, y1);
    const Point a = plot.at(x0, y0), b = plot.at(x1, y1);
    if (!std::isfinite(a.x + a.y + b.x + b.y))
        return;
    plot.canvas.pushClip(plot.area);
    const Rect r{std::min(a.x, b.x), std::min(a.y, b.y), std::fabs(b.x - a.x), std::fabs(b.y - a.y)};
    plot.canvas.rect(r, guideStyle(plot, guide));
    drawGuideLabel(plot, guide, {r.x, r.y}, {r.right(), r.y}, false);
    plot.canvas.pop();
}

void measureNothing(Plot&, const Element*) {}

void drawPoint(Plot& plot, const Element* guide) {
    const double fx = fractionOf(plot, 0, attr(guide, "x"));
    const double fy = hasAttr(guide, "y") ? fractionOf(plot, 1, attr(guide, "y")) : 0.5;
    if (!std::isfinite(fx) || !std::isfinite(fy))
        return;
    const Point p = plot.at(fx, fy);
    plot.canvas.symbol(p, guideStyle(plot, guide));
    if (const Element* label = child(guide, "label"))
        framedText(plot.canvas, textOf(label), p, textStyleOf(plot, label),
                   plot.styles.resolve(label, "textFrameStyle"), 0.5, 0.5);
}

const MarkRegistrar lineGuides({"lineGuide", measureLine, drawLine});
const MarkRegistrar functionGuides({"functionGuide", measureNothing, drawFunction});
const MarkRegistrar rectangleGuides({"rectangleGuide", measureRectangle, drawRectangle});
const MarkRegistrar pointGuides({"pointGuide", measureNothing, drawPoint});

} // namespace
} // namespace plotaid::render
