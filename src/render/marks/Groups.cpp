#include "render/marks/Groups.h"

#include <map>

namespace plotaid::render {

std::string splitVariableOf(const Plot& plot, const Element* mark, std::string* domain) {
    const Element* dim0 = plot.dims[0].dimension;
    if (hasAttr(dim0, "clusterVariable"))
        return attr(dim0, "clusterVariable");
    const Element* split = child(mark, "split");
    const std::string xVariable = attr(child(mark, "x"), "variable");
    if (split == nullptr)
        for (const char* kind : {"color", "styleBy", "dash", "shape"})
            for (const Element* a : children(mark, kind)) {
                const Column* c = plot.data.variable(attr(a, "variable"));
                if (c && c->categorical && attr(a, "variable") != xVariable) {
                    split = a;
                    break;
                }
            }
    if (domain && split)
        *domain = attr(split, "domain");
    return attr(split, "variable");
}

int methodOf(const Element* mark, int fallback) {
    const Element* s = child(mark, "summaryStatistic");
    return s ? static_cast<int>(number(s, "method", fallback)) : fallback;
}

double centreOf(const Plot& plot, const Grouping& g, const Summary& s, double* band) {
    const Scale& sx = plot.dims[0];
    double centre = sx.categorical ? sx.atCategory(s.xIndex) : sx.at(s.x);
    double width = sx.categorical ? sx.band() : 0.02;
    if (hasAttr(sx.dimension, "clusterVariable") && g.split != nullptr) {
        width /= static_cast<double>(g.splits);
        centre += (static_cast<double>(s.splitIndex) - (static_cast<double>(g.splits) - 1) / 2.0) * width;
    }
    if (band)
        *band = width;
    return centre;
}

std::size_t rowsIn(const Grouping& g) {
    std::size_t n = 0;
    for (const Summary& s : g.summaries)
        n += s.rows.size();
    return n;
}

bool stacked(const Element* mark) {
    return attr(mark, "positionModifier") == "3" || attr(mark, "positionModifier") == "stack";
}

Grouping group(const Plot& plot, const Element* mark) {
    Grouping g;
    const Column* x = plot.columnOf(mark, "x");
    const Column* y = plot.columnOf(mark, "y");
    if (y == nullptr) {
        const Element* s = child(mark, "summaryStatistic");
        y = s ? plot.data.variable(attr(s, "variable")) : nullptr;
    }
    std::string splitDomain;
    const std::string splitVariable = splitVariableOf(plot, mark, &splitDomain);
    g.split = plot.data.variable(splitVariable);
    if (g.split) {
        g.splitCategories = plot.data.categories(splitVariable, splitDomain);
        g.splits = std::max<std::size_t>(1, g.splitCategories.size());
    }
    const Column* rowsOf = x ? x : y ? y : g.split;
    if (rowsOf == nullptr)
        return g;
    const int method = methodOf(mark, y ? 2 : 1);
    const Scale& sx = plot.dims[0];
    std::map<std::pair<double, std::size_t>, std::size_t> at;
    std::size_t shown = 0;
    for (std::size_t row = 0; row < rowsOf->text.size(); ++row) {
        if (!plot.rowShown(row))
            continue;
        ++shown;
        double key = 0;
        std::size_t xIndex = 0;
        if (x && sx.categorical) {
            const int i = sx.indexOf(x->text[row]);
            if (i < 0)
                continue;
            xIndex = static_cast<std::size_t>(i);
            key = i;
        } else if (x) {
            key = x->values[row];
            if (std::isnan(key))
                continue;
        }
        std::size_t splitIndex = 0;
        if (g.split) {
            int i = -1;
            for (std::size_t c = 0; c < g.splitCategories.size(); ++c)
                if (row < g.split->text.size() && g.splitCategories[c] == g.split->text[row])
                    i = static_cast<int>(c);
            if (i < 0)
                continue;
            splitIndex = static_cast<std::size_t>(i);
        }
        auto [it, fresh] = at.emplace(std::make_pair(key, splitIndex), g.summaries.size());
        if (fresh) {
            Summary s;
            s.xIndex = xIndex;
            s.x = x && !sx.categorical ? key : NAN;
            s.splitIndex = splitIndex;
            s.firstRow = row;
            g.summaries.push_back(s);
        }
        g.summaries[it->second].values.push_back(y && row < y->values.size() ? y->values[row] : 1);
        g.summaries[it->second].rows.push_back(row);
    }
    for (Summary& s : g.summaries)
        s.y = statistic(method, s.values, static_cast<double>(shown));
    return g;
}

Slot slotOf(const Plot& plot, const Grouping& g, const Summary& s) {
    const Scale& sx = plot.dims[0];
    Slot slot{sx.categorical ? sx.atCategory(s.xIndex) : sx.at(s.x), sx.categorical ? sx.band() : 0.02};
    if (hasAttr(sx.dimension, "clusterVariable") && g.split != nullptr && g.splits > 1) {
        slot.band /= static_cast<double>(g.splits);
        slot.centre +=
            (static_cast<double>(s.splitIndex) - static_cast<double>(g.splits - 1) / 2.0) * slot.band;
    }
    return slot;
}

} // namespace plotaid::render
