#ifndef PLOTAID_CHARTRENDERER_H
#define PLOTAID_CHARTRENDERER_H

#include <plotaid/Export.h>

#include <string>

class ChartTransformer;
class GrxVisualization;

// Draws a chart document, with the data it embeds, as a picture: frames at their locations
// (charts without locations are laid out first, on a copy), titles, legends, axes and marks in
// the styles the chart states. Lives in its own library, libplotaid_render, so that a host that
// only builds charts does not load the drawing stack.
class PLOTAID_API ChartRenderer {
public:
    enum Format { SVG, PNG, PDF };

    ChartRenderer() = default;

    // The picture's size: pixels for PNG, points for SVG and PDF. Sizes outside 16..10000 are
    // refused by render().
    void setSize(double width, double height);
    double width() const { return width_; }
    double height() const { return height_; }

    // The format a file name asks for (".svg", ".png", ".pdf", any case); false for others.
    static bool formatOf(const std::string& path, Format& format);

    // The picture's bytes in `out`. False, with a reason in lastError(), when the chart has no
    // root or the drawing fails; `out` is then empty.
    bool render(const GrxVisualization& chart, Format format, std::string& out);
    // A chart as a transformer holds it: its sources may have moved to the transformer's data,
    // and are joined back (on a copy) before drawing.
    bool render(ChartTransformer& chart, Format format, std::string& out);
    // Two charts side by side on one picture of twice the width: before and after, say.
    bool renderSideBySide(const GrxVisualization& left, const GrxVisualization& right, Format format,
                          std::string& out);
    bool renderSideBySide(ChartTransformer& left, ChartTransformer& right, Format format, std::string& out);

    const std::string& lastError() const { return error_; }

private:
    bool draw(const GrxVisualization* const* charts, int count, Format format, std::string& out);

    double width_ = 800;
    double height_ = 600;
    std::string error_;
};

#endif
