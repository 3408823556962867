#include <plotaid/ChartRenderer.h>

#include <plotaid/ChartTransformer.h>
#include <plotaid/FramePacker.h>

#include "render/Frames.h"
#include "render/Graph.h"
#include "render/Legend.h"

#include <grx/GrxModel.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/framework/MemBufInputSource.hpp>
#include <xercesc/parsers/XercesDOMParser.hpp>

#include <algorithm>
#include <cctype>
#include <memory>

using namespace plotaid::render;

namespace {

// The chart's own sizes (points) are meant for a page of this size; larger pictures scale them.
constexpr double kDesignWidth = 640;
constexpr double kDesignHeight = 480;

// Frames that have no location at all need a layout before they can be drawn. A container needs
// none: the graphs in it are placed by their own.
bool needsPacking(const Element* root) {
    for (const Element* f : framesOf(root))
        if (nameOf(f) != "container" && child(f, "location") == nullptr)
            return true;
    return false;
}

TextSize labelFrameSize(const Page& page, const Element* frame) {
    TextSize total;
    for (const Element* label : children(frame, "label")) {
        const Style s = page.styles.resolve(label, "style", page.styles.chart());
        const TextSize t = page.canvas.measure(textOf(label), s);
        total.w = std::max(total.w, t.w);
        total.h += t.h;
    }
    const double pad = 2 * page.canvas.unit();
    return {total.w + 2 * pad, total.h + 2 * pad};
}

void drawLabelFrame(const Page& page, const Element* frame, const Rect& at) {
    const Style frameStyle = page.styles.resolve(frame, "style", page.styles.chart());
    if (!frameStyle.visible.value_or(true))
        return;
    page.canvas.rect(at, frameStyle);
    const double pad = 2 * page.canvas.unit();
    double y = at.y + pad;
    for (const Element* label : children(frame, "label")) {
        const Style s = page.styles.resolve(label, "style", page.styles.chart());
        const std::string text = textOf(label);
        const std::string align = s.align.value_or("left");
        const double ax = align == "center" ? 0.5 : align == "right" ? 1 : 0;
        const double x = at.x + pad + ax * (at.w - 2 * pad);
        page.canvas.text(text, {x, y}, s, ax, 0);
        y += page.canvas.measure(text, s).h;
    }
}

void drawPage(const Page& page, const Element* root, const Rect& area) {
    Style background = page.styles.resolve(root, "style");
    if (!background.color)
        background.color = Rgba{1, 1, 1, 1};
    page.canvas.rect(area, background, true, false);
    const auto frames = framesOf(root);
    const auto rects = layoutFrames(frames, area, page.canvas.unit(), [&](const Element* f) -> TextSize {
        const std::string name = nameOf(f);
        if (name == "legend")
            return legendSize(page, f);
        if (name == "graph" || name == "container")
            return {area.w / 2, area.h / 2};
        return labelFrameSize(page, f);
    });
    // Graphs first, so titles, legends and annotations lie on top of them.
    for (const Element* f : frames)
        if (nameOf(f) == "graph")
            drawGraph(page, f, rects.at(f));
    for (const Element* f : frames) {
        const std::string name = nameOf(f);
        if (name == "legend")
            drawLegend(page, f, rects.at(f));
        else if (name != "graph" && name != "container")
            drawLabelFrame(page, f, rects.at(f));
    }
}

} // namespace

void ChartRenderer::setSize(double width, double height) {
    width_ = width;
    height_ = height;
}

bool ChartRenderer::formatOf(const std::string& path, Format& format) {
    const std::size_t dot = path.rfind('.');
    if (dot == std::string::npos)
        return false;
    std::string ext = path.substr(dot + 1);
    for (char& c : ext)
        c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    if (ext == "svg")
        format = SVG;
    else if (ext == "png")
        format = PNG;
    else if (ext == "pdf")
        format = PDF;
    else
        return false;
    return true;
}

bool ChartRenderer::render(const GrxVisualization& chart, Format format, std::string& out) {
    const GrxVisualization* charts[] = {&chart};
    return draw(charts, 1, format, out);
}

bool ChartRenderer::renderSideBySide(const GrxVisualization& left, const GrxVisualization& right,
                                     Format format, std::string& out) {
    const GrxVisualization* charts[] = {&left, &right};
    return draw(charts, 2, format, out);
}

namespace {
// The transformer's chart, or a joined copy of it and its data when its sources moved out. The
// copy is the transformer's own serialisation, so a plain parse reads it; wrapping it registers
// its ids.
const GrxVisualization* withData(ChartTransformer& chart, std::unique_ptr<GrxVisualization>& joined) {
    const GrxVisualization* vis = chart.getVisualization();
    if (vis == nullptr || vis->getUserSources().empty())
        return vis;
    const std::string text = chart.getEntireXML(nullptr);
    xercesc::XercesDOMParser parser;
    parser.setDoNamespaces(true);
    parser.setCreateEntityReferenceNodes(false);
    parser.setDisableDefaultEntityResolution(true);
    xercesc::MemBufInputSource input(reinterpret_cast<const XMLByte*>(text.data()), text.size(), "chart");
    try {
        parser.parse(input);
    } catch (...) {
        return nullptr;
    }
    if (parser.getErrorCount() != 0 || parser.getDocument() == nullptr ||
        parser.getDocument()->getDocumentElement() == nullptr)
        return nullptr;
    xercesc::DOMDocument* document = parser.adoptDocument();
    joined = std::make_unique<GrxVisualization>(document->getDocumentElement(), true);
    return joined.get();
}
} // namespace

bool ChartRenderer::render(ChartTransformer& chart, Format format, std::string& out) {
    std::unique_ptr<GrxVisualization> joined;
    const GrxVisualization* vis = withData(chart, joined);
    if (vis == nullptr) {
        out.clear();
        error_ = "the transformer holds no chart";
        return false;
    }
    return render(*vis, format, out);
}

bool ChartRenderer::renderSideBySide(ChartTransformer& left, ChartTransformer& right, Format format,
                                     std::string& out) {
    std::unique_ptr<GrxVisualization> joinedLeft, joinedRight;
    const GrxVisualization* a = withData(left, joinedLeft);
    const GrxVisualization* b = withData(right, joinedRight);
    if (a == nullptr || b == nullptr) {
        out.clear();
        error_ = "the transformer holds no chart";
        return false;
    }
    return renderSideBySide(*a, *b, format, out);
}

bool ChartRenderer::draw(const GrxVisualization* const* charts, int count, Format format, std::string& out) {
    out.clear();
    error_.clear();
    if (!(width_ >= 16 && width_ <= 10000 && height_ >= 16 && height_ <= 10000)) {
        error_ = "the picture size must lie between 16 and 10000 on each side";
        return false;
    }
    const OutputFormat kind = format == SVG   ? OutputFormat::Svg
                              : format == PNG ? OutputFormat::Png
                                              : OutputFormat::Pdf;
    const double unit = std::min(width_ / kDesignWidth, height_ / kDesignHeight);
    Canvas canvas(kind, width_ * count, height_, unit);
    if (!canvas.ok()) {
        error_ = "the drawing surface cannot be made";
        return false;
    }
    for (int i = 0; i < count; ++i) {
        const Element* root = charts[i]->getImplementation();
        if (root == nullptr) {
            error_ = "the chart has no document";
            return false;
        }
        // A chart without locations is packed on a copy, as a host packs it before showing it.
        std::unique_ptr<GrxVisualization> packed;
        if (needsPacking(root)) {
            auto* copy = static_cast<xercesc::DOMDocument*>(root->getOwnerDocument()->cloneNode(true));
            packed = std::make_unique<GrxVisualization>(copy->getDocumentElement(), true);
            FramePacker().packFrames(*packed, nullptr);
            root = packed->getImplementation();
        }
        const StyleBook styles(root);
        const ChartData data(root);
        const Page page{canvas, styles, data};
        // Side by side, neither chart's overflowing text reaches into the other.
        const Rect area{width_ * i, 0, width_, height_};
        canvas.pushClip(area);
        drawPage(page, root, area);
        canvas.pop();
    }
    out = canvas.finish();
    if (out.empty()) {
        error_ = "the picture cannot be written";
        return false;
    }
    return true;
}
