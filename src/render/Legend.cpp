#include "render/Legend.h"

#include <algorithm>
#include <set>

namespace plotaid::render {

namespace {

constexpr std::size_t kMaxEntries = 100;

const Element* markOf(const Element* aesthetic) {
    const auto* parent = aesthetic ? aesthetic->getParentNode() : nullptr;
    return parent && parent->getNodeType() == xercesc::DOMNode::ELEMENT_NODE
               ? static_cast<const Element*>(parent)
               : nullptr;
}

const Element* graphOf(const Element* mark) {
    const auto* parent = mark ? mark->getParentNode() : nullptr;
    return parent && parent->getNodeType() == xercesc::DOMNode::ELEMENT_NODE
               ? static_cast<const Element*>(parent)
               : nullptr;
}

struct Metrics {
    double swatch, gap, pad, titleH;
    Style title, text;
};

Metrics metricsOf(const Page& page, const Element* legend) {
    const double u = page.canvas.unit();
    Metrics m{};
    const Style frame = page.styles.resolve(legend, "style", page.styles.chart());
    m.text = page.styles.resolve(legend, "tickTextStyle", page.styles.chart());
    const Element* label = child(legend, "label");
    m.title = page.styles.resolve(label, "style", page.styles.chart());
    m.swatch = std::max(8 * u, page.canvas.measure("Xg", m.text).h * 0.8);
    m.gap = 3 * u;
    m.pad = frame.padding.value_or(3) * u;
    m.titleH =
        label && m.title.visible.value_or(true) ? page.canvas.measure(textOf(label), m.title).h + m.gap : 0;
    return m;
}

// Line swatches are wide enough to show a dash and its gap; texts line up after the widest.
double swatchWidth(const Metrics& m, const std::vector<LegendEntry>& entries) {
    for (const LegendEntry& e : entries)
        if (e.markName == "line")
            return 3 * m.swatch;
    return m.swatch;
}

} // namespace

std::vector<LegendEntry> legendEntries(const Page& page, const Element* legend) {
    std::vector<LegendEntry> out;
    std::set<std::string> seen;
    for (const Element* target : children(legend, "legendTarget")) {
        const Element* aesthetic = byId(legend, attr(target, "target"));
        // A mark as the target is one entry: its name, else its variable's label.
        if (aesthetic && markKind(nameOf(aesthetic)) && out.size() < kMaxEntries) {
            const Column* c = page.data.variable(attr(target, "variable"));
            std::string text = attr(aesthetic, "name");
            if (text.empty() && c)
                text = c->label;
            out.push_back({text, page.styles.resolve(aesthetic, "style"), nameOf(aesthetic)});
            continue;
        }
        const Element* mark = markOf(aesthetic);
        if (aesthetic == nullptr || mark == nullptr || markKind(nameOf(mark)) == nullptr)
            continue;
        const std::string variable = attr(aesthetic, "variable");
        const Column* column = page.data.variable(variable);
        if (column == nullptr || !column->categorical)
            continue;
        Plot plot{page.canvas, page.styles, page.data, graphOf(mark), nullptr, {}, {}, false, false, false, 0,
                  {},          {},          {}};
        for (const std::string& category : page.data.categories(variable, attr(aesthetic, "domain"))) {
            if (out.size() >= kMaxEntries || !seen.insert(category).second)
                continue;
            // The style of the first row in the category is the style of all its rows.
            const auto row = std::find(column->text.begin(), column->text.end(), category);
            if (row == column->text.end())
                continue;
            out.push_back({category,
                           plot.rowStyle(mark, static_cast<std::size_t>(row - column->text.begin())),
                           nameOf(mark)});
        }
    }
    return out;
}

TextSize legendSize(const Page& page, const Element* legend) {
    const Metrics m = metricsOf(page, legend);
    double w = page.canvas.measure(textOf(child(legend, "label")), m.title).w, h = m.titleH;
    const auto entries = legendEntries(page, legend);
    const double swatchW = swatchWidth(m, entries);
    for (const LegendEntry& e : entries) {
        const TextSize t = page.canvas.measure(e.text, m.text);
        w = std::max(w, swatchW + m.gap + t.w);
        h += std::max(m.swatch, t.h) + m.gap;
    }
    return {w + 2 * m.pad, h + 2 * m.pad};
}

void drawLegend(const Page& page, const Element* legend, const Rect& at) {
    const Style frame = page.styles.resolve(legend, "style", page.styles.chart());
    if (!frame.visible.value_or(true))
        return;
    const Metrics m = metricsOf(page, legend);
    page.canvas.rect(at, frame);
    double y = at.y + m.pad;
    if (m.titleH > 0)
        page.canvas.text(textOf(child(legend, "label")), {at.x + m.pad, y}, m.title);
    y += m.titleH;
    const auto entries = legendEntries(page, legend);
    const double swatchW = swatchWidth(m, entries);
    for (const LegendEntry& e : entries) {
        const double rowH = std::max(m.swatch, page.canvas.measure(e.text, m.text).h);
        const Rect box{at.x + m.pad, y + (rowH - m.swatch) / 2, e.markName == "line" ? swatchW : m.swatch,
                       m.swatch};
        if (e.markName == "line") {
            const Style stroke = lineStroke(e.style);
            page.canvas.line({box.x, box.y + box.h / 2}, {box.right(), box.y + box.h / 2}, stroke);
            if (stroke.symbol && *stroke.symbol != "none") {
                Style marker = stroke;
                if (!marker.color || marker.color->a == 0)
                    marker.color = stroke.color2;
                page.canvas.symbol({box.x + box.w / 2, box.y + box.h / 2}, marker);
            }
        } else if (e.markName == "point") {
            page.canvas.symbol({box.x + box.w / 2, box.y + box.h / 2}, e.style);
        } else {
            page.canvas.rect(box, e.style);
        }
        page.canvas.text(e.text, {at.x + m.pad + swatchW + m.gap, y + rowH / 2}, m.text, 0, 0.5);
        y += rowH + m.gap;
    }
}

} // namespace plotaid::render
