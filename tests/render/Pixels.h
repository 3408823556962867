// Rendered PNG bytes as pixels to sample.
#ifndef PLOTAID_TESTS_RENDER_PIXELS_H
#define PLOTAID_TESTS_RENDER_PIXELS_H

#include <cairo.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

namespace pixels {

struct Rgb {
    int r, g, b;
};

struct Image {
    int w = 0, h = 0;
    std::vector<std::uint32_t> argb; // premultiplied, as Cairo keeps it; charts draw on opaque white

    Rgb at(int x, int y) const {
        const std::uint32_t p = argb[static_cast<std::size_t>(y) * w + x];
        return {int(p >> 16 & 255), int(p >> 8 & 255), int(p & 255)};
    }
    bool near(int x, int y, Rgb c, int tolerance = 24) const {
        const Rgb p = at(x, y);
        return std::abs(p.r - c.r) <= tolerance && std::abs(p.g - c.g) <= tolerance &&
               std::abs(p.b - c.b) <= tolerance;
    }
    // Pixels near the colour in [x0, x1) x [y0, y1), clipped to the image.
    int count(int x0, int y0, int x1, int y1, Rgb c, int tolerance = 24) const {
        int n = 0;
        for (int y = std::max(0, y0); y < std::min(h, y1); ++y)
            for (int x = std::max(0, x0); x < std::min(w, x1); ++x)
                n += near(x, y, c, tolerance);
        return n;
    }
};

inline Image decode(const std::string& png) {
    struct Reader {
        const std::string* bytes;
        std::size_t at;
    } reader{&png, 0};
    cairo_surface_t* s = cairo_image_surface_create_from_png_stream(
        [](void* closure, unsigned char* data, unsigned int length) {
            auto* r = static_cast<Reader*>(closure);
            if (r->bytes->size() - r->at < length)
                return CAIRO_STATUS_READ_ERROR;
            std::memcpy(data, r->bytes->data() + r->at, length);
            r->at += length;
            return CAIRO_STATUS_SUCCESS;
        },
        &reader);
    Image image;
    if (cairo_surface_status(s) == CAIRO_STATUS_SUCCESS) {
        cairo_surface_flush(s);
        image.w = cairo_image_surface_get_width(s);
        image.h = cairo_image_surface_get_height(s);
        const int stride = cairo_image_surface_get_stride(s);
        const unsigned char* data = cairo_image_surface_get_data(s);
        for (int y = 0; y < image.h; ++y)
            for (int x = 0; x < image.w; ++x)
                image.argb.push_back(reinterpret_cast<const std::uint32_t*>(data + y * stride)[x]);
    }
    cairo_surface_destroy(s);
    return image;
}

} // namespace pixels

#endif
