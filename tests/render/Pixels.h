#ifndef PLOTAID_TESTS_RENDER_PIXELS_H
#define PLOTAID_TESTS_RENDER_PIXELS_H

// Rendering sample charts to PNG in memory and reading their pixels back.

#include <plotaid/ChartRenderer.h>
#include <plotaid/ChartTransformer.h>

#include "support/TestSupport.h"

#include <cairo.h>

#include <algorithm>

#include <cstdlib>
#include <string>
#include <vector>

struct Rgb {
    int r = 0, g = 0, b = 0;
    bool near(const Rgb& o, int tolerance = 24) const {
        return std::abs(r - o.r) <= tolerance && std::abs(g - o.g) <= tolerance &&
               std::abs(b - o.b) <= tolerance;
    }
    // Grey has no saturation; anything further from grey than the tolerance is coloured.
    bool saturated(int tolerance = 12) const {
        const int hi = std::max({r, g, b}), lo = std::min({r, g, b});
        return hi - lo > tolerance;
    }
};

inline Rgb hex(unsigned v) {
    return {int(v >> 16 & 0xFF), int(v >> 8 & 0xFF), int(v & 0xFF)};
}

class Image {
public:
    explicit Image(const std::string& png) {
        Reader reader{&png, 0};
        surface_ = cairo_image_surface_create_from_png_stream(read, &reader);
    }
    ~Image() { cairo_surface_destroy(surface_); }
    Image(const Image&) = delete;
    Image& operator=(const Image&) = delete;

    bool ok() const { return cairo_surface_status(surface_) == CAIRO_STATUS_SUCCESS; }
    int width() const { return cairo_image_surface_get_width(surface_); }
    int height() const { return cairo_image_surface_get_height(surface_); }
    Rgb at(int x, int y) const {
        if (x < 0 || y < 0 || x >= width() || y >= height())
            return {-1, -1, -1};
        const unsigned char* row =
            cairo_image_surface_get_data(surface_) + y * cairo_image_surface_get_stride(surface_);
        const unsigned px = reinterpret_cast<const unsigned*>(row)[x];
        return hex(px & 0xFFFFFF);
    }
    // Pixels of the box [x0,x1) x [y0,y1) that satisfy `test`.
    template <class F> int count(int x0, int y0, int x1, int y1, F test) const {
        int n = 0;
        for (int y = std::max(0, y0); y < std::min(height(), y1); ++y)
            for (int x = std::max(0, x0); x < std::min(width(), x1); ++x)
                n += test(at(x, y)) ? 1 : 0;
        return n;
    }
    bool near(int x, int y, const Rgb& c, int tolerance = 24) const { return at(x, y).near(c, tolerance); }
    int count(int x0, int y0, int x1, int y1, const Rgb& c, int tolerance = 24) const {
        return count(x0, y0, x1, y1, [&](const Rgb& p) { return p.near(c, tolerance); });
    }
    int countNear(const Rgb& c, int tolerance = 24) const {
        return count(0, 0, width(), height(), [&](const Rgb& p) { return p.near(c, tolerance); });
    }

private:
    struct Reader {
        const std::string* bytes;
        std::size_t at;
    };
    static cairo_status_t read(void* closure, unsigned char* data, unsigned int length) {
        auto* r = static_cast<Reader*>(closure);
        if (r->bytes->size() - r->at < length)
            return CAIRO_STATUS_READ_ERROR;
        std::copy_n(r->bytes->data() + r->at, length, data);
        r->at += length;
        return CAIRO_STATUS_SUCCESS;
    }
    cairo_surface_t* surface_;
};

inline std::string sampleChart(const std::string& name) {
    return readAll(std::string(PLOTAID_EXAMPLES_DIR) + "/charts/" + name + ".xml");
}
inline std::string designerTemplate(const std::string& name) {
    return readAll(std::string(PLOTAID_EXAMPLES_DIR) + "/templates/" + name + ".sgt");
}

// A sample chart after the named templates, drawn in `format` at w x h; empty when anything fails.
inline std::string drawn(const std::string& chart, const std::vector<std::string>& templates = {},
                         int w = 640, int h = 480, ChartRenderer::Format format = ChartRenderer::PNG) {
    ChartTransformer transformer(sampleChart(chart));
    for (const std::string& t : templates)
        if (!transformer.applyTemplate(designerTemplate(t)))
            return {};
    ChartRenderer renderer;
    renderer.setSize(w, h);
    std::string out;
    return renderer.render(transformer, format, out) ? out : std::string();
}

#endif
