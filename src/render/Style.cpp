#include "render/Style.h"

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <sstream>

namespace plotaid::render {

namespace {

struct Named {
    const char* name;
    unsigned rgb;
};
// The CSS and the chart grammar's own basic names; anything else is read as a hex value or ignored.
constexpr Named kNames[] = {
    {"black", 0x000000},  {"white", 0xFFFFFF},  {"red", 0xFF0000},       {"green", 0x008000},
    {"blue", 0x0000FF},   {"yellow", 0xFFFF00}, {"cyan", 0x00FFFF},      {"magenta", 0xFF00FF},
    {"gray", 0x808080},   {"grey", 0x808080},   {"lightgray", 0xD3D3D3}, {"darkgray", 0xA9A9A9},
    {"orange", 0xFFA500}, {"purple", 0x800080}, {"brown", 0xA52A2A},     {"navy", 0x000080},
    {"maroon", 0x800000}, {"olive", 0x808000},  {"teal", 0x008080},      {"silver", 0xC0C0C0},
    {"lime", 0x00FF00},   {"pink", 0xFFC0CB},
};

Rgba fromRgb(unsigned v) {
    return {((v >> 16) & 0xFF) / 255.0, ((v >> 8) & 0xFF) / 255.0, (v & 0xFF) / 255.0, 1};
}

std::optional<double> points(const Element* e, const char* name) {
    Length l;
    if (!hasAttr(e, name) || !parseLength(preferredPart(attr(e, name)), l) || l.percent || l.value < 0)
        return std::nullopt;
    return l.value;
}

} // namespace

std::optional<Rgba> parseColor(const std::string& text) {
    std::string t;
    for (char c : text)
        if (c != ' ')
            t += static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    if (t == "transparent" || t == "none")
        return Rgba{0, 0, 0, 0};
    if (!t.empty() && t[0] == '#') {
        const std::string hex = t.substr(1);
        if (hex.size() != 3 && hex.size() != 6)
            return std::nullopt;
        if (hex.find_first_not_of("0123456789abcdef") != std::string::npos)
            return std::nullopt;
        unsigned v = static_cast<unsigned>(std::strtoul(hex.c_str(), nullptr, 16));
        if (hex.size() == 3)
            v = ((v & 0xF00) << 12 | (v & 0xF00) << 8) | ((v & 0xF0) << 8 | (v & 0xF0) << 4) |
                ((v & 0xF) << 4 | (v & 0xF));
        return fromRgb(v);
    }
    unsigned r, g, b;
    char close = 0;
    if (std::sscanf(t.c_str(), "rgb(%u,%u,%u%c", &r, &g, &b, &close) == 4 && close == ')' && r < 256 &&
        g < 256 && b < 256)
        return fromRgb(r << 16 | g << 8 | b);
    for (const Named& n : kNames)
        if (t == n.name)
            return fromRgb(n.rgb);
    return std::nullopt;
}

void Style::layer(const Style& o) {
    auto take = [](auto& mine, const auto& theirs) {
        if (theirs)
            mine = theirs;
    };
    take(color, o.color);
    take(color2, o.color2);
    take(strokeWidth, o.strokeWidth);
    take(dash, o.dash);
    take(fontFamily, o.fontFamily);
    take(fontSize, o.fontSize);
    take(bold, o.bold);
    take(italic, o.italic);
    take(visible, o.visible);
    take(opacity, o.opacity);
    take(symbol, o.symbol);
    take(size, o.size);
    take(width, o.width);
    take(pattern, o.pattern);
    take(align, o.align);
    take(labelAngle, o.labelAngle);
    take(padding, o.padding);
}

Style Style::of(const Element* e) {
    Style s;
    if (e == nullptr)
        return s;
    if (hasAttr(e, "color"))
        s.color = parseColor(attr(e, "color"));
    if (hasAttr(e, "color2"))
        s.color2 = parseColor(attr(e, "color2"));
    s.strokeWidth = points(e, "stroke-width");
    if (hasAttr(e, "stroke-dasharray")) {
        std::vector<double> dash;
        std::istringstream in(attr(e, "stroke-dasharray"));
        std::string part;
        bool valid = true;
        while (in >> part && dash.size() < 16) {
            Length l;
            if (!parseLength(part, l) || l.value < 0) {
                valid = false;
                break;
            }
            dash.push_back(l.value);
        }
        // A dash of zero total length would stall the stroker; it means solid.
        double total = 0;
        for (double d : dash)
            total += d;
        if (!valid || total <= 0)
            dash.clear();
        s.dash = dash;
    }
    if (hasAttr(e, "font-family"))
        s.fontFamily = attr(e, "font-family");
    s.fontSize = points(e, "font-size");
    if (hasAttr(e, "font-weight"))
        s.bold = attr(e, "font-weight") == "bold";
    if (hasAttr(e, "font-style"))
        s.italic = attr(e, "font-style") == "italic";
    if (hasAttr(e, "visible"))
        s.visible = !(attr(e, "visible") == "false" || attr(e, "visible") == "hidden");
    if (hasAttr(e, "fill-opacity"))
        s.opacity = std::fmin(1.0, std::fmax(0.0, number(e, "fill-opacity", 1)));
    if (hasAttr(e, "transparency"))
        s.opacity = 1 - std::fmin(1.0, std::fmax(0.0, number(e, "transparency", 0)));
    if (hasAttr(e, "symbol"))
        s.symbol = attr(e, "symbol");
    s.size = points(e, "size");
    Length w;
    if (hasAttr(e, "width") && parseLength(preferredPart(attr(e, "width")), w) && w.value >= 0)
        s.width = w;
    if (hasAttr(e, "fill-pattern"))
        s.pattern = attr(e, "fill-pattern");
    if (hasAttr(e, "textAlignment"))
        s.align = attr(e, "textAlignment");
    s.padding = points(e, "padding");
    if (hasAttr(e, "labelAngle"))
        s.labelAngle = number(e, "labelAngle", 0);
    return s;
}

StyleBook::StyleBook(const Element* root) : root_(root) {
    chart_.color2 = Rgba{0, 0, 0, 1};
    chart_.strokeWidth = 0.5;
    chart_.fontFamily = "DejaVu Sans";
    chart_.fontSize = 9;
    chart_ = resolve(root, "style", chart_);
    // The chart's own fill is its background, not a default for every shape on it.
    chart_.color.reset();
}

Style StyleBook::byId(const std::string& id) const {
    const Element* e = render::byId(root_, id);
    return nameOf(e) == "style" ? Style::of(e) : Style();
}

Style StyleBook::resolve(const Element* e, const char* attribute, const Style& base) const {
    Style s = base;
    std::istringstream ids(attr(e, attribute));
    std::string id;
    while (ids >> id)
        s.layer(byId(id));
    return s;
}

} // namespace plotaid::render
