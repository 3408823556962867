#include "render/Canvas.h"

#include <cairo-pdf.h>
#include <cairo-svg.h>
#include <cairo.h>
#include <pango/pangocairo.h>

#include <algorithm>
#include <cmath>

namespace plotaid::render {

namespace {

cairo_status_t append(void* closure, const unsigned char* data, unsigned int length) {
    static_cast<std::string*>(closure)->append(reinterpret_cast<const char*>(data), length);
    return CAIRO_STATUS_SUCCESS;
}

// Java-like logical names that charts use map to fonts every Debian machine has.
std::string familyOf(const Style& s) {
    const std::string f = s.fontFamily.value_or("DejaVu Sans");
    if (f == "SansSerif" || f == "Dialog" || f.empty())
        return "DejaVu Sans";
    if (f == "Serif")
        return "DejaVu Serif";
    if (f == "Monospaced")
        return "DejaVu Sans Mono";
    return f;
}

PangoFontDescription* fontOf(const Style& s, double unit) {
    PangoFontDescription* font = pango_font_description_new();
    pango_font_description_set_family(font, familyOf(s).c_str());
    const double size = std::clamp(s.fontSize.value_or(9.0), 1.0, 200.0) * unit;
    pango_font_description_set_absolute_size(font, size * PANGO_SCALE);
    pango_font_description_set_weight(font, s.bold.value_or(false) ? PANGO_WEIGHT_BOLD : PANGO_WEIGHT_NORMAL);
    pango_font_description_set_style(font,
                                     s.italic.value_or(false) ? PANGO_STYLE_ITALIC : PANGO_STYLE_NORMAL);
    return font;
}

struct Layout {
    PangoLayout* layout;
    explicit Layout(cairo_t* cr, const std::string& text, const Style& s, double unit) {
        layout = pango_cairo_create_layout(cr);
        PangoFontDescription* font = fontOf(s, unit);
        pango_layout_set_font_description(layout, font);
        pango_font_description_free(font);
        pango_layout_set_text(layout, text.c_str(), static_cast<int>(text.size()));
    }
    ~Layout() { g_object_unref(layout); }
    TextSize size() const {
        int w = 0, h = 0;
        pango_layout_get_size(layout, &w, &h);
        return {double(w) / PANGO_SCALE, double(h) / PANGO_SCALE};
    }
};

// Pango takes only valid UTF-8; a chart's text may hold anything.
std::string validUtf8(const std::string& text) {
    const gchar* end = nullptr;
    if (g_utf8_validate(text.c_str(), static_cast<gssize>(text.size()), &end))
        return text;
    gchar* fixed = g_utf8_make_valid(text.c_str(), static_cast<gssize>(text.size()));
    std::string out(fixed);
    g_free(fixed);
    return out;
}

} // namespace

Canvas::Canvas(OutputFormat format, double width, double height, double unit)
    : format_(format), width_(width), height_(height), unit_(unit) {
    switch (format) {
    case OutputFormat::Png:
        surface_ = cairo_image_surface_create(CAIRO_FORMAT_ARGB32, static_cast<int>(std::lround(width)),
                                              static_cast<int>(std::lround(height)));
        break;
    case OutputFormat::Svg:
        surface_ = cairo_svg_surface_create_for_stream(append, &bytes_, width, height);
        break;
    case OutputFormat::Pdf:
        surface_ = cairo_pdf_surface_create_for_stream(append, &bytes_, width, height);
        break;
    }
    cr_ = cairo_create(surface_);
    cairo_set_line_join(cr_, CAIRO_LINE_JOIN_MITER);
}

Canvas::~Canvas() {
    if (cr_)
        cairo_destroy(cr_);
    if (surface_)
        cairo_surface_destroy(surface_);
}

bool Canvas::ok() const {
    return surface_ && cairo_surface_status(surface_) == CAIRO_STATUS_SUCCESS && cr_ &&
           cairo_status(cr_) == CAIRO_STATUS_SUCCESS;
}

void Canvas::setColor(const Rgba& c, double opacity) {
    cairo_set_source_rgba(cr_, c.r, c.g, c.b, c.a * opacity);
}

bool Canvas::stroke(const Style& s) const {
    return s.visible.value_or(true) && s.color2 && s.color2->a > 0 && s.strokeWidth.value_or(0.5) > 0;
}

bool Canvas::fill(const Style& s) const {
    return s.visible.value_or(true) && s.color && s.color->a > 0;
}

void Canvas::applyStroke(const Style& s) {
    setColor(*s.color2);
    cairo_set_line_width(cr_, std::min(s.strokeWidth.value_or(0.5), 100.0) * unit_);
    std::vector<double> dash;
    if (s.dash)
        for (double d : *s.dash)
            dash.push_back(std::min(d, 1000.0) * unit_);
    cairo_set_dash(cr_, dash.data(), static_cast<int>(dash.size()), 0);
}

void Canvas::rect(const Rect& r, const Style& s, bool withFill, bool withStroke) {
    if (!(std::isfinite(r.x) && std::isfinite(r.y) && std::isfinite(r.w) && std::isfinite(r.h)))
        return;
    polygon({{r.x, r.y}, {r.right(), r.y}, {r.right(), r.bottom()}, {r.x, r.bottom()}}, s, withFill,
            withStroke);
}

void Canvas::polygon(const std::vector<Point>& points, const Style& s, bool withFill, bool withStroke) {
    if (points.size() < 2)
        return;
    for (const Point& p : points)
        if (!std::isfinite(p.x) || !std::isfinite(p.y))
            return;
    cairo_new_path(cr_);
    for (const Point& p : points)
        cairo_line_to(cr_, p.x, p.y);
    cairo_close_path(cr_);
    if (withFill && fill(s)) {
        setColor(*s.color, s.opacity.value_or(1));
        cairo_fill_preserve(cr_);
    }
    if (withStroke && stroke(s)) {
        applyStroke(s);
        cairo_stroke_preserve(cr_);
    }
    cairo_new_path(cr_);
}

void Canvas::polyline(const std::vector<Point>& points, const Style& s) {
    if (points.size() < 2 || !stroke(s))
        return;
    cairo_new_path(cr_);
    for (const Point& p : points) {
        if (!std::isfinite(p.x) || !std::isfinite(p.y)) {
            cairo_new_sub_path(cr_);
            continue;
        }
        cairo_line_to(cr_, p.x, p.y);
    }
    applyStroke(s);
    cairo_stroke(cr_);
}

void Canvas::line(Point a, Point b, const Style& s) {
    polyline({a, b}, s);
}

void Canvas::wedge(Point c, double radius, double a0, double a1, const Style& s) {
    if (!(radius > 0) || !std::isfinite(a0) || !std::isfinite(a1))
        return;
    cairo_new_path(cr_);
    cairo_move_to(cr_, c.x, c.y);
    cairo_arc(cr_, c.x, c.y, radius, a0 - M_PI / 2, a1 - M_PI / 2);
    cairo_close_path(cr_);
    if (fill(s)) {
        setColor(*s.color, s.opacity.value_or(1));
        cairo_fill_preserve(cr_);
    }
    if (stroke(s)) {
        applyStroke(s);
        cairo_stroke_preserve(cr_);
    }
    cairo_new_path(cr_);
}

void Canvas::symbol(Point p, const Style& s) {
    const std::string kind = s.symbol.value_or("circle");
    if (kind == "none" || !s.visible.value_or(true))
        return;
    const double r = std::clamp(s.size.value_or(5.0), 0.0, 100.0) * unit_ / 2;
    Style outline = s;
    if (!outline.color2)
        outline.color2 = s.color;
    outline.dash = std::vector<double>();
    outline.strokeWidth = std::min(s.strokeWidth.value_or(0.5), 1.0);
    if (kind == "square") {
        rect({p.x - r, p.y - r, 2 * r, 2 * r}, outline);
    } else if (kind == "triangle") {
        polygon({{p.x, p.y - r}, {p.x + r, p.y + r}, {p.x - r, p.y + r}}, outline);
    } else if (kind == "diamond") {
        polygon({{p.x, p.y - r}, {p.x + r, p.y}, {p.x, p.y + r}, {p.x - r, p.y}}, outline);
    } else if (kind == "star" || kind == "polygon") {
        const int tips = kind == "star" ? 5 : 6;
        std::vector<Point> pts;
        for (int i = 0; i < 2 * tips; ++i) {
            const double rr = kind == "star" && i % 2 ? r * 0.45 : r;
            const double a = M_PI * i / tips - M_PI / 2;
            if (kind == "polygon" && i % 2)
                continue;
            pts.push_back({p.x + rr * std::cos(a), p.y + rr * std::sin(a)});
        }
        polygon(pts, outline);
    } else if (kind == "cross" || kind == "plus" || kind == "ibeam") {
        Style stroke = outline;
        if (!stroke.color2 || stroke.color2->a == 0)
            stroke.color2 = s.color;
        line({p.x - r, p.y}, {p.x + r, p.y}, stroke);
        if (kind != "ibeam")
            line({p.x, p.y - r}, {p.x, p.y + r}, stroke);
    } else {
        cairo_new_path(cr_);
        cairo_arc(cr_, p.x, p.y, r, 0, 2 * M_PI);
        if (fill(outline)) {
            setColor(*outline.color, outline.opacity.value_or(1));
            cairo_fill_preserve(cr_);
        }
        if (stroke(outline)) {
            applyStroke(outline);
            cairo_stroke_preserve(cr_);
        }
        cairo_new_path(cr_);
    }
}

TextSize Canvas::measure(const std::string& text, const Style& s) const {
    if (text.empty())
        return {};
    Layout layout(cr_, validUtf8(text), s, unit_);
    return layout.size();
}

void Canvas::text(const std::string& text, Point anchor, const Style& s, double ax, double ay, double angle) {
    if (text.empty() || !s.visible.value_or(true) || !std::isfinite(anchor.x) || !std::isfinite(anchor.y))
        return;
    // A text style's main colour is its ink; a transparent ink hides the text.
    const Rgba ink = s.color ? *s.color : Rgba{0, 0, 0, 1};
    if (ink.a <= 0)
        return;
    Layout layout(cr_, validUtf8(text), s, unit_);
    const TextSize size = layout.size();
    if (format_ == OutputFormat::Svg)
        noteFont(s);
    cairo_save(cr_);
    cairo_translate(cr_, anchor.x, anchor.y);
    if (std::isfinite(angle))
        cairo_rotate(cr_, -angle * M_PI / 180);
    cairo_move_to(cr_, -ax * size.w, -ay * size.h);
    setColor(ink);
    pango_cairo_show_layout(cr_, layout.layout);
    cairo_restore(cr_);
}

void Canvas::pushClip(const Rect& r) {
    cairo_save(cr_);
    cairo_rectangle(cr_, r.x, r.y, r.w, r.h);
    cairo_clip(cr_);
}

void Canvas::pop() {
    cairo_restore(cr_);
}

void Canvas::noteFont(const Style& s) {
    const std::string requested = familyOf(s) + (s.bold.value_or(false) ? "|bold" : "|normal") +
                                  (s.italic.value_or(false) ? "|italic" : "|normal");
    auto it = resolved_.find(requested);
    if (it == resolved_.end()) {
        std::string actual = requested;
        PangoFontDescription* wanted = fontOf(s, 1);
        PangoLayout* probe = pango_cairo_create_layout(cr_);
        if (PangoFont* font = pango_context_load_font(pango_layout_get_context(probe), wanted)) {
            PangoFontDescription* got = pango_font_describe(font);
            if (const char* family = pango_font_description_get_family(got))
                actual = family + requested.substr(requested.find('|'));
            pango_font_description_free(got);
            g_object_unref(font);
        }
        g_object_unref(probe);
        pango_font_description_free(wanted);
        it = resolved_.emplace(requested, actual).first;
    }
    fonts_.insert(it->second);
}

namespace {
std::string escaped(const std::string& text) {
    std::string out;
    for (char c : text)
        out += c == '"'   ? std::string("&quot;")
               : c == '&' ? std::string("&amp;")
               : c == '<' ? std::string("&lt;")
                          : std::string(1, c);
    return out;
}
} // namespace

// The fonts go into the SVG's metadata, right after the root's start tag.
std::string Canvas::svgWithFonts(std::string svg) const {
    const std::size_t root = svg.find("<svg");
    const std::size_t end = root == std::string::npos ? root : svg.find('>', root);
    if (end == std::string::npos || fonts_.empty())
        return svg;
    std::string meta = "\n<metadata><fonts xmlns=\"http://plotaid.org/render\">";
    for (const std::string& f : fonts_) {
        const std::size_t a = f.find('|'), b = f.find('|', a + 1);
        meta += "<font font-family=\"" + escaped(f.substr(0, a)) + "\" font-weight=\"" +
                f.substr(a + 1, b - a - 1) + "\" font-style=\"" + f.substr(b + 1) + "\"/>";
    }
    meta += "</fonts></metadata>";
    return svg.insert(end + 1, meta);
}

std::string Canvas::finish() {
    if (finished_ || !ok())
        return {};
    finished_ = true;
    if (format_ == OutputFormat::Png) {
        cairo_surface_flush(surface_);
        if (cairo_surface_write_to_png_stream(surface_, append, &bytes_) != CAIRO_STATUS_SUCCESS)
            return {};
    } else {
        cairo_surface_finish(surface_);
        if (cairo_surface_status(surface_) != CAIRO_STATUS_SUCCESS)
            return {};
        if (format_ == OutputFormat::Svg)
            return svgWithFonts(std::move(bytes_));
    }
    return std::move(bytes_);
}

} // namespace plotaid::render
