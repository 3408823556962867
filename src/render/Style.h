// What a chart's styles say, resolved for drawing: colours, strokes, fonts, symbols, sizes.
#ifndef PLOTAID_RENDER_STYLE_H
#define PLOTAID_RENDER_STYLE_H

#include "render/Dom.h"

#include <optional>
#include <string>
#include <vector>

namespace plotaid::render {

struct Rgba {
    double r = 0, g = 0, b = 0, a = 1;
    bool operator==(const Rgba& o) const { return r == o.r && g == o.g && b == o.b && a == o.a; }
};
// "#RGB", "#RRGGBB", "rgb(r,g,b)", a CSS colour name, or "transparent"/"none" (alpha 0).
std::optional<Rgba> parseColor(const std::string& text);

// Style properties as plain values. Unset optionals mean "the chart does not say", so layering
// one style over another keeps what the upper one leaves out.
struct Style {
    std::optional<Rgba> color;               // fill
    std::optional<Rgba> color2;              // stroke and text
    std::optional<double> strokeWidth;       // points
    std::optional<std::vector<double>> dash; // points; empty means solid
    std::optional<std::string> fontFamily;
    std::optional<double> fontSize; // points
    std::optional<bool> bold;
    std::optional<bool> italic;
    std::optional<bool> visible;
    std::optional<double> opacity; // fill-opacity, 0..1
    std::optional<std::string> symbol;
    std::optional<double> size;         // points
    std::optional<Length> width;        // bar and box widths, usually a percent
    std::optional<std::string> pattern; // fill-pattern
    std::optional<std::string> align;   // textAlignment
    std::optional<double> labelAngle;
    std::optional<double> padding; // points

    // Properties of `over` replace those of this style.
    void layer(const Style& over);
    static Style of(const Element* styleElement);
};

// The styles of one chart by id, with the visualization style underneath everything.
class StyleBook {
public:
    explicit StyleBook(const Element* root);
    // The style an element names in `attribute` (ids separated by spaces, later ones on top),
    // layered over `base`.
    Style resolve(const Element* e, const char* attribute = "style", const Style& base = Style()) const;
    Style byId(const std::string& id) const;
    const Style& chart() const { return chart_; }

private:
    const Element* root_;
    Style chart_;
};

} // namespace plotaid::render

#endif
