#include "render/Facets.h"

#include <algorithm>
#include <cctype>
#include <cstdlib>

namespace plotaid::render {

namespace {

// A hostile chart may list any number of categories or columns; panels beyond these are left out.
constexpr std::size_t kMaxSide = 24;
constexpr std::size_t kMaxCells = 144;
constexpr std::size_t kMaxCoordinates = 8;

enum Side { Left, Bottom, Right, Top };

// The labels of one facet level: one per panel along it, and the level's title.
struct Labels {
    std::vector<std::string> texts;
    std::vector<Style> fills, styles;
    std::string title;
    Style titleStyle;
    double strip = 0, titleSize = 0; // thickness, device units
};

struct Grid {
    std::size_t columns = 0, rows = 0, count = 0;
    bool wrapped = false; // one level wrapped into rows, each panel under its own strip
    bool matrix = false;
    std::string variable[2];
    std::vector<const Column*> listed[2]; // matrix columns along x and y
    const Column* by[2] = {nullptr, nullptr};
    std::vector<std::string> categories[2];
    const Element* level[2] = {nullptr, nullptr};
    double gap[2] = {0, 0};
    Labels labels[2];
};

// The room between panels, at most half the extent in all.
double gapOf(const Element* level, double extent, double unit, std::size_t panels) {
    Length l;
    if (panels < 2 || !parseLength(attr(level, "gap"), l) || !std::isfinite(l.value) || l.value < 0)
        return 0;
    return std::min(l.percent ? l.value / 100 * extent : l.value * unit,
                    extent / 2 / static_cast<double>(panels - 1));
}

Grid gridOf(const Page& page, const Element* graph, const Element* layout, const Rect& inner) {
    Grid g;
    for (const Element* l : children(layout, "facetLevel")) {
        const int at = number(l, "level", 1) == 2 ? 1 : 0;
        if (g.level[at] == nullptr)
            g.level[at] = l;
    }
    // A matrix's point lists its columns in expression variables for x and y. Any element with an
    // x counts, drawn or not, so that the grid does not depend on which marks are known.
    for (const Element* m : children(graph)) {
        if (child(m, "x") == nullptr)
            continue;
        for (int d = 0; d < 2; ++d) {
            g.variable[d] = attr(child(m, d ? "y" : "x"), "variable");
            g.listed[d] = page.data.expressionColumns(g.variable[d]);
            g.listed[d].resize(std::min(g.listed[d].size(), kMaxSide));
        }
        break;
    }
    g.matrix = !g.listed[0].empty() && !g.listed[1].empty();
    if (g.matrix) {
        g.columns = g.listed[0].size();
        g.rows = g.listed[1].size();
    } else {
        for (int d = 0; d < 2; ++d) {
            std::string variable = attr(g.level[d], "variable");
            if (variable.empty() && d == 0)
                variable = attr(child(graph, "faceting"), "variable");
            g.by[d] = page.data.variable(variable);
            if (g.by[d])
                g.categories[d] = page.data.categories(variable);
            g.categories[d].resize(std::min(g.categories[d].size(), kMaxCells));
        }
        if (g.categories[0].empty())
            return g;
        g.wrapped = attr(layout, "method") == "2" && g.categories[1].empty();
        if (g.wrapped) {
            const std::size_t n = g.categories[0].size();
            g.columns = static_cast<std::size_t>(std::ceil(std::sqrt(static_cast<double>(n))));
            g.rows = (n + g.columns - 1) / g.columns;
        } else {
            g.categories[0].resize(std::min(g.categories[0].size(), kMaxSide));
            g.categories[1].resize(std::min(g.categories[1].size(), kMaxSide));
            g.columns = g.categories[0].size();
            g.rows = std::max<std::size_t>(1, g.categories[1].size());
        }
    }
    g.rows = std::min(g.rows, std::max<std::size_t>(1, kMaxCells / g.columns));
    g.count = g.wrapped ? g.categories[0].size() : g.columns * g.rows;
    g.gap[0] = gapOf(g.level[0], inner.w, page.canvas.unit(), g.columns);
    g.gap[1] = gapOf(g.level[1] ? g.level[1] : g.level[0], inner.h, page.canvas.unit(), g.rows);

    // Labels in the facet axis' style: categories by the ticks' style on a strip of the axis'
    // fill; a matrix names each column with its own axis' label.
    const double pad = 1.5 * page.canvas.unit();
    for (int d = 0; d < 2; ++d) {
        Labels& L = g.labels[d];
        const auto axes = children(g.level[d], "axis");
        const std::size_t n = g.matrix ? g.listed[d].size() : g.categories[d].size();
        for (std::size_t i = 0; i < n; ++i) {
            const Element* axis = g.matrix && i < axes.size() ? axes[i] : axes.empty() ? nullptr : axes[0];
            Style fill = page.styles.resolve(axis, "style", page.styles.chart());
            Style style;
            std::string text;
            if (g.matrix) {
                const Element* label = child(axis, "label");
                style = page.styles.resolve(label, "style", page.styles.chart());
                text = textOf(label).empty() ? g.listed[d][i]->label : textOf(label);
            } else {
                style = page.styles.resolve(child(axis, "majorTicks"), "style", page.styles.chart());
                text = g.categories[d][i];
            }
            if (!fill.visible.value_or(true))
                continue;
            L.strip = std::max(L.strip, page.canvas.measure(text, style).h + 2 * pad);
            L.texts.push_back(text);
            L.fills.push_back(fill);
            L.styles.push_back(style);
        }
        L.texts.resize(L.fills.size() == n ? n : 0); // a hidden axis hides the level's labels
        if (L.texts.empty())
            L.strip = 0;
        const Element* title = g.matrix || axes.empty() ? nullptr : child(axes[0], "label");
        L.titleStyle = page.styles.resolve(title, "style", page.styles.chart());
        L.title = L.texts.empty() || !L.titleStyle.visible.value_or(true) ? "" : textOf(title);
        if (!L.title.empty())
            L.titleSize = page.canvas.measure(L.title, L.titleStyle).h + pad;
    }
    return g;
}

// The rows a panel shows: those whose facet variables hold its categories.
std::vector<bool> rowsOf(const Grid& g, std::size_t category0, std::size_t category1) {
    std::vector<bool> rows;
    if (g.matrix || g.by[0] == nullptr)
        return rows;
    rows.resize(g.by[0]->text.size());
    for (std::size_t r = 0; r < rows.size(); ++r)
        rows[r] = g.by[0]->text[r] == g.categories[0][category0] &&
                  (g.by[1] == nullptr || g.categories[1].empty() ||
                   (r < g.by[1]->text.size() && g.by[1]->text[r] == g.categories[1][category1]));
    return rows;
}

void drawStrip(Canvas& canvas, const Labels& L, std::size_t i, const Rect& at, bool vertical) {
    if (i >= L.texts.size())
        return;
    canvas.rect(at, L.fills[i], true, false);
    canvas.text(L.texts[i], {at.x + at.w / 2, at.y + at.h / 2}, L.styles[i], 0.5, 0.5, vertical ? -90 : 0);
}

} // namespace

void Cell::enter(Plot& plot) const {
    plot.panel.facet[0] = column + 1;
    plot.panel.facet[1] = row + 1;
    for (int d = 0; d < 2; ++d) {
        plot.panel.variable[d] = variable[d];
        plot.panel.column[d] = matrix[d];
    }
}

void Cell::share(Plot& plot) {
    for (int d = 0; d < 3; ++d) {
        ownLo[d] = plot.dims[d].lo;
        ownHi[d] = plot.dims[d].hi;
        plot.dims[d].include(sharedLo[d]);
        plot.dims[d].include(sharedHi[d]);
    }
}

bool Cell::fit(double& left, double& bottom, double& right, double& top) {
    double* sides[4] = {&left, &bottom, &right, &top};
    for (int i = 0; i < 4; ++i) {
        if (measuring)
            room[i] = std::max(room[i], *sides[i]);
        *sides[i] = 0;
    }
    return !measuring;
}

bool Cell::paints(bool vertical, bool opposite) const {
    return vertical ? outer[opposite ? Right : Left] : outer[opposite ? Top : Bottom];
}

bool conditionHolds(const std::string& when, const int facet[2]) {
    if (facet[0] < 0)
        return false;
    std::string w;
    for (char c : when)
        if (!std::isspace(static_cast<unsigned char>(c)))
            w += c;
    bool equal = true;
    std::size_t at = w.find("==");
    if (at == std::string::npos) {
        at = w.find("!=");
        equal = false;
    }
    if (at == std::string::npos)
        return false;
    int values[2];
    const std::string operands[2] = {w.substr(0, at), w.substr(at + 2)};
    for (int i = 0; i < 2; ++i) {
        const std::string& t = operands[i];
        if (t == "facet1" || t == "facet2")
            values[i] = facet[t[5] - '1'];
        else if (!t.empty() && t.size() < 7 && t.find_first_not_of("0123456789") == std::string::npos)
            values[i] = std::atoi(t.c_str());
        else
            return false;
    }
    return (values[0] == values[1]) == equal;
}

bool drawFacets(const Page& page, const Element* graph, const Rect& inner) {
    const Element* layout = child(graph, "facetLayout");
    if (layout == nullptr || page.cell != nullptr)
        return false;
    Grid g = gridOf(page, graph, layout, inner);
    if (g.count == 0 || g.columns == 0 || g.rows == 0)
        return false;
    auto coordinates = children(graph, "coordinates");
    coordinates.resize(std::min({coordinates.size(), kMaxCoordinates, kMaxCells / g.count + 1}));

    // One cell per panel and coordinates; panel p lies at column p % columns, row p / columns.
    std::vector<Cell> cells(g.count * coordinates.size());
    std::vector<std::vector<bool>> rows(g.count);
    for (std::size_t p = 0; p < g.count; ++p) {
        const std::size_t c = p % g.columns, r = p / g.columns;
        rows[p] = g.wrapped ? rowsOf(g, p, 0) : rowsOf(g, c, r);
        for (std::size_t k = 0; k < coordinates.size(); ++k) {
            Cell& cell = cells[k * g.count + p];
            cell.column = static_cast<int>(g.wrapped ? p : c);
            cell.row = static_cast<int>(g.wrapped ? 0 : r);
            cell.outer[Left] = c == 0;
            cell.outer[Right] = c + 1 == g.columns;
            cell.outer[Top] = r == 0;
            cell.outer[Bottom] = r + 1 == g.rows || p + g.columns >= g.count;
            for (int d = 0; d < 2 && g.matrix; ++d) {
                cell.variable[d] = g.variable[d];
                cell.matrix[d] = g.listed[d][d ? r : c];
            }
        }
    }
    auto measureAll = [&] {
        for (std::size_t i = 0; i < cells.size(); ++i) {
            Page sub = page;
            sub.cell = &cells[i];
            cells[i].measuring = true;
            drawCoordinates(sub, graph, coordinates[i / g.count], inner, rows[i % g.count], true,
                            static_cast<int>(i / g.count));
        }
    };
    // Panels share their scales; a matrix shares x down a column and y along a row.
    measureAll();
    for (std::size_t i = 0; i < cells.size(); ++i)
        for (std::size_t j = i - i % g.count; j < i - i % g.count + g.count; ++j)
            for (int d = 0; d < 3; ++d) {
                const std::size_t p = i % g.count, q = j % g.count;
                if (g.matrix && ((d == 0 && p % g.columns != q % g.columns) ||
                                 (d == 1 && p / g.columns != q / g.columns)))
                    continue;
                Cell& to = cells[i];
                for (double v : {cells[j].ownLo[d], cells[j].ownHi[d]})
                    if (std::isfinite(v)) {
                        to.sharedLo[d] = std::isnan(to.sharedLo[d]) ? v : std::min(to.sharedLo[d], v);
                        to.sharedHi[d] = std::isnan(to.sharedHi[d]) ? v : std::max(to.sharedHi[d], v);
                    }
            }
    // With the shared scales the tick labels, and so the room for the axes, are final.
    measureAll();
    double room[4] = {};
    for (const Cell& cell : cells)
        for (int s = 0; s < 4; ++s)
            room[s] = std::max(room[s], cell.room[s]);

    const Labels& across = g.labels[0];
    const Labels& down = g.labels[1];
    const double top = across.titleSize + (g.wrapped ? 0 : across.strip);
    const double right = down.titleSize + down.strip;
    const Rect grid{inner.x + room[Left], inner.y + top + room[Top],
                    std::max(1.0, inner.w - room[Left] - room[Right] - right),
                    std::max(1.0, inner.h - top - room[Top] - room[Bottom])};
    const double slotW = std::max(1.0, (grid.w - g.gap[0] * (g.columns - 1)) / g.columns);
    const double slotH = std::max(1.0, (grid.h - g.gap[1] * (g.rows - 1)) / g.rows);
    const double strip = g.wrapped ? std::min(across.strip, slotH / 2) : 0;

    Canvas& canvas = page.canvas;
    const Style cellStyle = page.styles.resolve(graph, "cellStyle", page.styles.chart());
    for (std::size_t p = 0; p < g.count; ++p) {
        const std::size_t c = p % g.columns, r = p / g.columns;
        const Rect slot{grid.x + c * (slotW + g.gap[0]), grid.y + r * (slotH + g.gap[1]), slotW, slotH};
        const Rect area{slot.x, slot.y + strip, slot.w, std::max(1.0, slot.h - strip)};
        canvas.rect(area, cellStyle);
        for (std::size_t k = 0; k < coordinates.size(); ++k) {
            Page sub = page;
            sub.cell = &cells[k * g.count + p];
            sub.cell->measuring = false;
            sub.cell->grid = grid;
            sub.cell->titles[0] = c == 0 && r + 1 == g.rows;
            sub.cell->titles[1] = c == 0 && r == 0;
            drawCoordinates(sub, graph, coordinates[k], area, rows[p], true, static_cast<int>(k));
        }
        if (g.wrapped)
            drawStrip(canvas, across, p, Rect{slot.x, slot.y, slot.w, strip}, false);
        if (!g.wrapped && r == 0)
            drawStrip(canvas, across, c, Rect{slot.x, inner.y + across.titleSize, slot.w, across.strip},
                      false);
        if (c + 1 == g.columns)
            drawStrip(canvas, down, r, Rect{inner.right() - right, slot.y, down.strip, slot.h}, true);
    }
    if (!across.title.empty())
        canvas.text(across.title, {grid.x + grid.w / 2, inner.y}, across.titleStyle, 0.5, 0);
    if (!down.title.empty())
        canvas.text(down.title, {inner.right(), grid.y + grid.h / 2}, down.titleStyle, 0.5, 0, -90);
    return true;
}

} // namespace plotaid::render
