// Box plots: a box from the lower to the upper quartile with the median across it, whiskers to the
// last values within 1.5 box lengths, outliers beyond that and extremes beyond 3 box lengths.
#include "render/marks/Groups.h"
#include "render/marks/Stats.h"

#include <algorithm>

namespace plotaid::render {
namespace {

struct Box {
    double q1 = NAN, median = NAN, q3 = NAN, low = NAN, high = NAN; // low/high: whisker ends
    std::vector<std::pair<double, std::size_t>> outliers, extremes; // value, row
};

// The rows behind a summary, in the order group() collected its values.
std::vector<std::size_t> rowsOf(const Plot& plot, const Element* mark, const Summary& s) {
    std::vector<std::size_t> rows;
    const Column* x = plot.columnOf(mark, "x");
    const Column* split = plot.data.variable(splitVariableOf(plot, mark));
    const Column* first = x ? x : split;
    if (first == nullptr)
        return rows;
    for (std::size_t row = s.firstRow; row < first->text.size() && rows.size() < s.values.size(); ++row) {
        if (!plot.rowShown(row))
            continue;
        if (x && x->text[row] != x->text[s.firstRow])
            continue;
        if (split && (row >= split->text.size() || split->text[row] != split->text[s.firstRow]))
            continue;
        rows.push_back(row);
    }
    return rows;
}

Box boxOf(const Plot& plot, const Element* mark, const Summary& s) {
    Box b;
    const std::vector<double> sorted = sortedFinite(s.values);
    if (sorted.empty())
        return b;
    b.q1 = quantile(sorted, 0.25);
    b.median = quantile(sorted, 0.5);
    b.q3 = quantile(sorted, 0.75);
    const double iqr = b.q3 - b.q1;
    b.low = b.q1;
    b.high = b.q3;
    const std::vector<std::size_t> rows = rowsOf(plot, mark, s);
    for (std::size_t i = 0; i < s.values.size(); ++i) {
        const double v = s.values[i];
        if (!std::isfinite(v))
            continue;
        const std::size_t row = i < rows.size() ? rows[i] : s.firstRow;
        const double beyond = v > b.q3 ? v - b.q3 : v < b.q1 ? b.q1 - v : 0;
        if (beyond > 3 * iqr)
            b.extremes.push_back({v, row});
        else if (beyond > 1.5 * iqr)
            b.outliers.push_back({v, row});
        else {
            b.low = std::min(b.low, v);
            b.high = std::max(b.high, v);
        }
    }
    return b;
}

void measure(Plot& plot, const Element* mark) {
    for (const Summary& s : group(plot, mark).summaries)
        for (double v : s.values)
            plot.dims[1].include(v);
}

double widthOf(const Style& s, double fallback) {
    return s.width && s.width->percent ? std::clamp(s.width->value / 100, 0.0, 1.0) : fallback;
}

void draw(Plot& plot, const Element* mark) {
    const Grouping g = group(plot, mark);
    const Scale& sy = plot.dims[1];
    Canvas& canvas = plot.canvas;
    const Style hinge = plot.styles.resolve(mark, "hingeStyle");
    const Style median = plot.styles.resolve(mark, "medianStyle");
    const Style fence = plot.styles.resolve(mark, "fenceStyle");
    Style outlier = plot.styles.resolve(mark, "outlierStyle");
    Style extreme = plot.styles.resolve(mark, "extremeStyle");
    outlier.symbol = outlier.symbol.value_or("circle");
    extreme.symbol = extreme.symbol.value_or("star");
    const Element* labeling = child(mark, "labeling");
    const Column* labels = labeling ? plot.data.variable(attr(labeling, "variable")) : nullptr;
    const Style labelStyle = plot.styles.resolve(labeling, "style", plot.styles.chart());

    for (const Summary& s : g.summaries) {
        const Box b = boxOf(plot, mark, s);
        if (std::isnan(b.q1))
            continue;
        const Style box = plot.rowStyle(mark, s.firstRow);
        const Slot slot = slotOf(plot, g, s);
        const double half = slot.band * widthOf(box, 0.4) / 2;
        const double cap = slot.band * widthOf(fence, widthOf(box, 0.4) / 2) / 2;
        auto at = [&](double along, double value) { return plot.at(slot.centre + along, sy.at(value)); };
        // Whiskers first, so the box covers their inner ends.
        for (double end : {b.low, b.high}) {
            const double from = end < b.q1 ? b.q1 : b.q3;
            canvas.line(at(0, from), at(0, end), fence);
            canvas.line(at(-cap, end), at(cap, end), fence);
        }
        const Point p = at(-half, b.q1), q = at(half, b.q3);
        canvas.rect(Rect{std::min(p.x, q.x), std::min(p.y, q.y), std::fabs(q.x - p.x), std::fabs(q.y - p.y)},
                    box);
        canvas.line(at(-half, b.q1), at(half, b.q1), hinge);
        canvas.line(at(-half, b.q3), at(half, b.q3), hinge);
        canvas.line(at(-half, b.median), at(half, b.median), median);
        for (const auto* list : {&b.outliers, &b.extremes})
            for (const auto& [value, row] : *list) {
                const Point c = at(0, value);
                canvas.symbol(c, list == &b.outliers ? outlier : extreme);
                if (labels && row < labels->text.size()) {
                    const std::string text =
                        labels->categorical || std::isnan(labels->values[row])
                            ? labels->text[row]
                            : formatNumber(labels->values[row], child(labeling, "format"));
                    canvas.text(text, {c.x + 4 * canvas.unit(), c.y}, labelStyle, 0, 0.5);
                }
            }
    }
}

const MarkRegistrar registrar({"schema", measure, draw});

} // namespace
} // namespace plotaid::render
