// A drawing surface in one of the output formats, with text laid out by Pango. Coordinates are
// device units with the origin at the top left; `unit` converts the chart's points to them.
#ifndef PLOTAID_RENDER_CANVAS_H
#define PLOTAID_RENDER_CANVAS_H

#include "render/Style.h"

#include <map>
#include <memory>
#include <set>
#include <string>
#include <vector>

typedef struct _cairo cairo_t;
typedef struct _cairo_surface cairo_surface_t;

namespace plotaid::render {

enum class OutputFormat { Svg, Png, Pdf };

struct Point {
    double x = 0, y = 0;
};
struct Rect {
    double x = 0, y = 0, w = 0, h = 0;
    double right() const { return x + w; }
    double bottom() const { return y + h; }
};

struct TextSize {
    double w = 0, h = 0;
};

class Canvas {
public:
    // A surface of width x height device units; `unit` device units per point.
    Canvas(OutputFormat format, double width, double height, double unit);
    ~Canvas();
    Canvas(const Canvas&) = delete;
    Canvas& operator=(const Canvas&) = delete;

    bool ok() const;
    double width() const { return width_; }
    double height() const { return height_; }
    double unit() const { return unit_; }

    // Shapes filled with the style's colour and outlined with its secondary colour and stroke;
    // a transparent or absent colour draws nothing for that part.
    void rect(const Rect& r, const Style& s, bool fill = true, bool stroke = true);
    void polygon(const std::vector<Point>& points, const Style& s, bool fill = true, bool stroke = true);
    void polyline(const std::vector<Point>& points, const Style& s);
    void line(Point a, Point b, const Style& s);
    // A pie or ring wedge around `c` from angle a0 to a1 (radians, clockwise from 12 o'clock).
    void wedge(Point c, double radius, double a0, double a1, const Style& s);
    // A marker of the style's symbol and size centred on `p`.
    void symbol(Point p, const Style& s);

    // Text in the style's font and main colour. `ax`/`ay` place the anchor: 0 left/top,
    // 0.5 centre, 1 right/bottom; the text turns `angle` degrees counterclockwise about it.
    TextSize measure(const std::string& text, const Style& s) const;
    void text(const std::string& text, Point anchor, const Style& s, double ax = 0, double ay = 0,
              double angle = 0);

    // Clipping to a rectangle until the matching pop.
    void pushClip(const Rect& r);
    void pop();

    // Finishes the surface and returns the file's bytes (empty on failure).
    std::string finish();

    cairo_t* context() { return cr_; }

private:
    void setColor(const Rgba& c, double opacity = 1);
    void applyStroke(const Style& s);
    bool stroke(const Style& s) const;
    bool fill(const Style& s) const;

    // The fonts text was drawn in, as the machine resolved them: an SVG names them, since its text
    // is drawn as glyph outlines.
    void noteFont(const Style& s);
    std::string svgWithFonts(std::string svg) const;
    std::map<std::string, std::string> resolved_; // requested -> "family|weight|style"
    std::set<std::string> fonts_;

    OutputFormat format_;
    double width_, height_, unit_;
    std::string bytes_;
    cairo_surface_t* surface_ = nullptr;
    cairo_t* cr_ = nullptr;
    bool finished_ = false;
};

} // namespace plotaid::render

#endif
