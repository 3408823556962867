#include "render/Plot.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <map>
#include <numeric>

namespace plotaid::render {

namespace {
std::map<std::string, MarkKind>& marks() {
    static std::map<std::string, MarkKind> all;
    return all;
}
} // namespace

MarkRegistrar::MarkRegistrar(const MarkKind& kind) {
    marks()[kind.tag] = kind;
}

const MarkKind* markKind(const std::string& tag) {
    auto it = marks().find(tag);
    return it == marks().end() ? nullptr : &it->second;
}

namespace {
std::vector<MarkVariant>& variants() {
    static std::vector<MarkVariant> all;
    return all;
}
} // namespace

MarkVariantRegistrar::MarkVariantRegistrar(const MarkVariant& variant) {
    auto& all = variants();
    // Sorted on entry, since registration order across files is unspecified.
    all.insert(std::upper_bound(all.begin(), all.end(), variant,
                                [](const MarkVariant& a, const MarkVariant& b) { return a.order < b.order; }),
               variant);
}

const MarkVariant* markVariant(const Plot& plot, const Element* mark) {
    const std::string tag = nameOf(mark);
    for (const MarkVariant& v : variants())
        if (tag == v.tag && v.applies(plot, mark))
            return &v;
    return nullptr;
}

void measureMark(Plot& plot, const Element* mark) {
    if (const MarkVariant* v = markVariant(plot, mark))
        v->measure(plot, mark);
    else if (const MarkKind* k = markKind(nameOf(mark)))
        k->measure(plot, mark);
}

void drawMark(Plot& plot, const Element* mark) {
    if (const MarkVariant* v = markVariant(plot, mark))
        v->draw(plot, mark);
    else if (const MarkKind* k = markKind(nameOf(mark)))
        k->draw(plot, mark);
}

bool startsAtZero(const Plot& plot, const Element* mark) {
    if (const MarkVariant* v = markVariant(plot, mark))
        return v->fromZero;
    return nameOf(mark) == "interval" || nameOf(mark) == "area";
}

void Scale::include(double v) {
    if (!std::isfinite(v))
        return;
    lo = std::isnan(lo) ? v : std::min(lo, v);
    hi = std::isnan(hi) ? v : std::max(hi, v);
}

void Scale::settle(bool includeZero) {
    if (categorical) {
        from = 0;
        to = 1;
        return;
    }
    double a = std::isnan(lo) ? 0 : lo, b = std::isnan(hi) ? 1 : hi;
    if (includeZero) {
        a = std::min(a, 0.0);
        b = std::max(b, 0.0);
    }
    if (b - a <= 0) {
        const double pad = a == 0 ? 1 : std::fabs(a) * 0.1;
        a -= pad;
        b += pad;
    }
    const double span = b - a;
    from = a - (includeZero && a == 0 ? 0 : lowerMargin * span);
    to = b + upperMargin * span;
    if (includeZero && a == 0)
        from = a - lowerMargin * span;
}

double Scale::at(double value) const {
    return to > from ? (value - from) / (to - from) : 0.5;
}

int Scale::indexOf(const std::string& category) const {
    for (std::size_t i = 0; i < categories.size(); ++i)
        if (categories[i] == category)
            return static_cast<int>(i);
    return -1;
}

double Scale::band() const {
    if (!categorical || categories.empty())
        return 0;
    return (1 - lowerMargin - upperMargin) / static_cast<double>(categories.size());
}

double Scale::atCategory(std::size_t index) const {
    return lowerMargin + band() * (static_cast<double>(index) + 0.5);
}

Point Plot::at(double fx, double fy) const {
    double u = fx, v = fy;
    if (transposed)
        std::swap(u, v);
    // x along the width, y up the height; transposed: x up the height, y along the width.
    return {area.x + u * area.w, area.bottom() - v * area.h};
}

const Column* Plot::columnOf(const Element* mark, const char* role) const {
    const Element* c = child(mark, role);
    const int d = std::string(role) == "x" ? 0 : std::string(role) == "y" ? 1 : -1;
    if (c && d >= 0 && panel.column[d] && attr(c, "variable") == panel.variable[d])
        return panel.column[d];
    return c ? data.variable(attr(c, "variable")) : nullptr;
}

Style Plot::cycleStyle(const std::string& cycleId, std::size_t index) const {
    const Element* cycle = child(byId(graph, cycleId), "cycle");
    const auto entries = children(cycle, "style");
    if (entries.empty())
        return Style();
    return Style::of(entries[index % entries.size()]);
}

Style Plot::rowStyle(const Element* mark, std::size_t row, const char* styleAttribute) const {
    Style s = styles.resolve(mark, styleAttribute);
    static const char* const kAesthetics[] = {"color",   "shape",        "size",   "dash",
                                              "pattern", "transparency", "styleBy"};
    for (const char* kind : kAesthetics)
        for (const Element* a : children(mark, kind)) {
            const std::string variable = attr(a, "variable");
            const Column* c = data.variable(variable);
            if (c == nullptr || row >= c->text.size() || !hasAttr(a, "cycle"))
                continue;
            std::size_t index = 0;
            if (c->categorical) {
                const auto& cats = data.categories(variable, attr(a, "domain"));
                const auto it = std::find(cats.begin(), cats.end(), c->text[row]);
                if (it == cats.end())
                    continue;
                index = static_cast<std::size_t>(it - cats.begin());
            }
            const Style entry = cycleStyle(attr(a, "cycle"), index);
            const std::string kindName = kind;
            if (kindName == "color") {
                const std::string affect = attr(a, "affect");
                if (entry.color && affect != "secondary")
                    s.color = entry.color;
                if (entry.color && (affect == "secondary" || affect == "both"))
                    s.color2 = entry.color;
                if (entry.opacity)
                    s.opacity = entry.opacity;
            } else if (kindName == "shape") {
                if (entry.symbol)
                    s.symbol = entry.symbol;
            } else if (kindName == "size") {
                if (entry.size)
                    s.size = entry.size;
            } else if (kindName == "dash") {
                if (entry.dash)
                    s.dash = entry.dash;
            } else {
                s.layer(entry);
            }
        }
    for (const Element* c : children(mark, "conditionalStyle"))
        if (conditionHolds(attr(c, "when"), panel.facet))
            s = styles.resolve(c, "style", s);
    return s;
}

Style lineStroke(Style s) {
    if (!s.color2 || s.color2->a == 0)
        s.color2 = s.color;
    return s;
}

double statistic(int method, const std::vector<double>& values, double total) {
    std::vector<double> v;
    for (double d : values)
        if (std::isfinite(d))
            v.push_back(d);
    switch (method) {
    case 1:
    case 10:
        return static_cast<double>(values.size());
    case 3:
        return total > 0 ? 100.0 * static_cast<double>(values.size()) / total : NAN;
    case 4:
        return std::accumulate(v.begin(), v.end(), 0.0);
    case 5: {
        if (v.empty())
            return NAN;
        std::sort(v.begin(), v.end());
        const std::size_t n = v.size();
        return n % 2 ? v[n / 2] : (v[n / 2 - 1] + v[n / 2]) / 2;
    }
    default:
        return v.empty() ? NAN : std::accumulate(v.begin(), v.end(), 0.0) / static_cast<double>(v.size());
    }
}

std::string formatNumber(double value, const Element* format) {
    if (!std::isfinite(value))
        return {};
    const int digits = static_cast<int>(std::clamp(number(format, "maximumFractionDigits", 2), 0.0, 10.0));
    char buffer[64];
    std::snprintf(buffer, sizeof buffer, "%.*f", digits, std::fabs(value));
    std::string text = buffer;
    // Trailing zeros of the fraction go, as a maximum (not a fixed) digit count means.
    if (text.find('.') != std::string::npos) {
        text.erase(text.find_last_not_of('0') + 1);
        if (text.back() == '.')
            text.pop_back();
    }
    if (flag(format, "useGrouping", false)) {
        const std::size_t point = std::min(text.find('.'), text.size());
        for (std::ptrdiff_t i = static_cast<std::ptrdiff_t>(point) - 3; i > 0; i -= 3)
            text.insert(static_cast<std::size_t>(i), ",");
    }
    if (value < 0 && text.find_first_not_of("0.,") != std::string::npos)
        text = "-" + text;
    return attr(format, "prefix") + text + attr(format, "suffix");
}

} // namespace plotaid::render
