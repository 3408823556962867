#include "render/marks/Labels.h"

#include "render/marks/Groups.h"

#include <cmath>
#include <sstream>

namespace plotaid::render {

namespace {

constexpr std::size_t kMaxLabelings = 8;

int placeWord(const std::string& v) {
    if (v == "1" || v == "center")
        return 1;
    if (v == "2" || v == "positive")
        return 2;
    return v == "3" || v == "negative" ? 3 : 0;
}

} // namespace

LabelPlace labelPlaceOf(const Plot& plot, const Element* e, const char* styleAttribute) {
    LabelPlace place;
    std::istringstream ids(attr(e, styleAttribute));
    std::string id;
    // Later styles win, as they do for every other property.
    while (ids >> id) {
        const Element* s = byId(plot.graph, id);
        if (const int h = placeWord(attr(s, "labelLocationHorizontal")))
            place.horizontal = h;
        if (const int v = placeWord(attr(s, "labelLocationVertical")))
            place.vertical = v;
    }
    return place;
}

std::string labelText(const Plot& plot, const Element* labeling, const Element* mark,
                      const std::vector<std::size_t>& rows, std::size_t total) {
    const Column* c = plot.data.variable(attr(labeling, "variable"));
    if (c == nullptr || rows.empty() || rows.front() >= c->text.size())
        return {};
    if (c->categorical)
        return c->text[rows.front()];
    const Element* stat = child(labeling, "summaryStatistic");
    const int method = stat              ? static_cast<int>(number(stat, "method", 2))
                       : rows.size() > 1 ? methodOf(mark, 2)
                                         : -1;
    // The two ends of a range belong to the error bar that draws them.
    if (method == 18 || method == 19)
        return {};
    std::vector<double> values;
    for (std::size_t r : rows)
        if (r < c->values.size())
            values.push_back(c->values[r]);
    const double v = method < 0 ? values.front() : statistic(method, values, static_cast<double>(total));
    const Element* format = child(labeling, "format");
    return formatNumber(v, format ? format : c->format);
}

Style textStyleOf(const Plot& plot, const Element* label) {
    return plot.styles.resolve(label, "style", plot.styles.chart());
}

void framedText(Canvas& canvas, const std::string& text, Point anchor, const Style& style, const Style& frame,
                double ax, double ay) {
    if (text.empty() || !style.visible.value_or(true))
        return;
    const TextSize size = canvas.measure(text, style);
    const double pad = 1.5 * canvas.unit();
    canvas.rect(
        {anchor.x - ax * size.w - pad, anchor.y - ay * size.h - pad, size.w + 2 * pad, size.h + 2 * pad},
        frame);
    canvas.text(text, anchor, style, ax, ay);
}

void drawLabels(const Plot& plot, const Element* mark, const std::vector<std::size_t>& rows,
                std::size_t total, Point base, Point tip) {
    const auto labelings = children(mark, "labeling");
    if (labelings.empty() || !std::isfinite(base.x + base.y + tip.x + tip.y))
        return;
    std::string text;
    const Element* first = nullptr;
    for (std::size_t i = 0; i < labelings.size() && i < kMaxLabelings; ++i) {
        const Style own = plot.styles.resolve(labelings[i], "style", plot.styles.chart());
        const std::string t = labelText(plot, labelings[i], mark, rows, total);
        if (t.empty() || !own.visible.value_or(true))
            continue;
        text += (text.empty() ? "" : "\n") + t;
        first = first ? first : labelings[i];
    }
    if (first == nullptr)
        return;
    const Style style = textStyleOf(plot, first);
    const Style frame = plot.styles.resolve(first, "textFrameStyle");
    const LabelPlace place = labelPlaceOf(plot, first);
    const double gap = 2 * plot.canvas.unit();
    const double dx = tip.x - base.x, dy = tip.y - base.y, length = std::hypot(dx, dy);
    Point at{(base.x + tip.x) / 2, (base.y + tip.y) / 2};
    double ax = 0.5, ay = 0.5;
    if (length > 0) {
        // Along a bar: beyond its end (positive), just inside it (negative), else its middle.
        const double ux = dx / length, uy = dy / length;
        if (place.vertical == 2 || place.vertical == 3) {
            const double out = place.vertical == 2 ? gap : -gap;
            at = {tip.x + ux * out, tip.y + uy * out};
            const bool beyond = place.vertical == 2;
            if (std::fabs(uy) >= std::fabs(ux))
                ay = (uy < 0) == beyond ? 1 : 0;
            else
                ax = (ux > 0) == beyond ? 0 : 1;
        }
    } else {
        // Beside a point: above unless the labelling asks otherwise.
        const double r =
            plot.rowStyle(mark, rows.empty() ? 0 : rows.front()).size.value_or(5) * plot.canvas.unit() / 2 +
            gap;
        const bool beside = place.horizontal == 2 || place.horizontal == 3;
        if (place.vertical == 2 || place.vertical == 3 || (place.vertical == 0 && !beside)) {
            at.y += place.vertical == 3 ? r : -r;
            ay = place.vertical == 3 ? 0 : 1;
        }
        if (beside) {
            at.x += place.horizontal == 2 ? r : -r;
            ax = place.horizontal == 2 ? 0 : 1;
        }
    }
    framedText(plot.canvas, text, at, style, frame, ax, ay);
}

} // namespace plotaid::render
