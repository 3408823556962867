// The renderer as a user sees it: pixels of sample charts before and after their templates, and
// the files each format writes.
#include "render/Pixels.h"

#include <plotaid/ChartRenderer.h>

#include "support/ToolRunner.h"

#include <gtest/gtest.h>

#include <fstream>

namespace {

const char* const kSamples[] = {"area",
                                "bar-3d",
                                "boxplot",
                                "clustered-bar",
                                "container-lines",
                                "dual-y-axis",
                                "error-bars",
                                "histogram",
                                "line-series",
                                "panels",
                                "pie",
                                "population-pyramid",
                                "scatter",
                                "scatterplot-matrix",
                                "simple-bar",
                                "stacked-bar"};
const char* const kTemplates[] = {"corporate", "monochrome", "presentation", "bar-tidy"};

const Rgb kBlue = hex(0x3E58AC), kGreen = hex(0x2EB848), kSand = hex(0xD3CE97), kBrand = hex(0x1F4E79);

// The simple bar chart's graph frame at 640x480: 12%..80% across, 12%..85% down.
constexpr int kGraphX0 = 77, kGraphX1 = 512, kGraphY0 = 58, kGraphY1 = 408;

std::string hidingTemplate(const std::string& instruction) {
    return R"(<template xmlns="http://plotaid.org/grxml">)" + instruction + "</template>";
}

TEST(Render, BarsTakeTheirCycleColoursAndTheCorporateBrandColour) {
    const Image before(drawn("simple-bar"));
    const Image after(drawn("simple-bar", {"corporate"}));
    ASSERT_TRUE(before.ok() && after.ok());
    // Each bar is several thousand pixels; the legend swatches alone are under a hundred.
    for (const Rgb& c : {kBlue, kGreen, kSand})
        EXPECT_GT(before.countNear(c, 8), 2000);
    EXPECT_LT(before.countNear(kBrand, 8), 50);
    EXPECT_GT(after.countNear(kBrand, 8), 2000);
    EXPECT_LT(after.countNear(kBlue, 8), 50);
}

TEST(Render, MonochromeLeavesNoColourInsideTheGraph) {
    for (const char* chart : {"simple-bar", "clustered-bar", "stacked-bar"}) {
        SCOPED_TRACE(chart);
        const Image before(drawn(chart));
        const Image after(drawn(chart, {"monochrome"}));
        auto coloured = [](const Rgb& p) { return p.saturated(); };
        EXPECT_GT(before.count(kGraphX0, kGraphY0, kGraphX1, kGraphY1, coloured), 1000);
        EXPECT_EQ(after.count(kGraphX0, kGraphY0, kGraphX1, kGraphY1, coloured), 0);
    }
}

TEST(Render, HiddenFramesDrawNothing) {
    ChartTransformer chart(sampleChart("simple-bar"));
    auto ink = [](const Image& image, int y0, int y1) {
        return image.count(0, y0, image.width(), y1, [](const Rgb& p) { return p.r + p.g + p.b < 200; });
    };
    ChartRenderer renderer;
    renderer.setSize(640, 480);
    std::string shown, hidden;
    ASSERT_TRUE(renderer.render(chart, ChartRenderer::PNG, shown));
    ASSERT_TRUE(chart.applyTemplate(hidingTemplate(R"(<hideFrame type="title" count="1"/>)")));
    ASSERT_TRUE(renderer.render(chart, ChartRenderer::PNG, hidden));
    // The title lies in the top tenth; the graph below it is untouched (the footnotes share the
    // title frame's style, so they go too).
    EXPECT_GT(ink(Image(shown), 0, 48), 100);
    EXPECT_EQ(ink(Image(hidden), 0, 48), 0);
    EXPECT_EQ(ink(Image(shown), 60, 420), ink(Image(hidden), 60, 420));
}

TEST(Render, TheLegendHoldsOneEntryPerCategoryOfItsAesthetic) {
    const struct {
        const char* chart;
        std::vector<Rgb> present, absent;
    } rows[] = {
        {"simple-bar", {kBlue, kGreen, kSand}, {}},
        {"clustered-bar", {kBlue, kGreen}, {kSand}},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.chart);
        const Image image(drawn(row.chart));
        // The legend column: right of the graph frame.
        auto in = [&](const Rgb& c) {
            return image.count(kGraphX1 + 4, 0, 640, 480, [&](const Rgb& p) { return p.near(c, 8); });
        };
        for (const Rgb& c : row.present)
            EXPECT_GT(in(c), 30);
        for (const Rgb& c : row.absent)
            EXPECT_EQ(in(c), 0);
    }
}

TEST(Render, TwoSizesKeepTheChartsProportions) {
    const Image small(drawn("simple-bar", {}, 400, 300));
    const Image large(drawn("simple-bar", {}, 1200, 900));
    ASSERT_EQ(small.width(), 400);
    ASSERT_EQ(large.height(), 900);
    for (const Rgb& c : {kBlue, kGreen, kSand}) {
        const double ratio = double(large.countNear(c, 8)) / std::max(1, small.countNear(c, 8));
        EXPECT_NEAR(ratio, 9.0, 0.9);
    }
}

TEST(Render, SvgIsWellFormedAndNamesItsFonts) {
    const TempDir dir;
    const std::string svg = drawn("simple-bar", {}, 640, 480, ChartRenderer::SVG);
    std::ofstream(dir.file("chart.svg"), std::ios::binary) << svg;
    EXPECT_EQ(runCommand("xmllint --noout '" + dir.file("chart.svg") + "' 2>&1").exitCode, 0);
    // The sample's "SansSerif" is drawn in the machine's sans-serif font, and the file says which.
    EXPECT_NE(svg.find("font-family=\"DejaVu Sans\""), std::string::npos);
}

TEST(Render, PdfOpensAsAPage) {
    const TempDir dir;
    const std::string pdf = drawn("simple-bar", {}, 640, 480, ChartRenderer::PDF);
    ASSERT_EQ(pdf.compare(0, 5, "%PDF-"), 0);
    std::ofstream(dir.file("chart.pdf"), std::ios::binary) << pdf;
    ASSERT_EQ(runCommand("pdftoppm -png -r 36 -singlefile '" + dir.file("chart.pdf") + "' '" +
                         dir.file("page") + "'")
                  .exitCode,
              0);
    const Image image(readAll(dir.file("page.png")));
    ASSERT_TRUE(image.ok());
    EXPECT_GT(image.countNear(kBlue, 24), 50);
}

TEST(Render, EverySampleRendersWithEveryDesignerTemplate) {
    for (const char* chart : kSamples) {
        for (int t = -1; t < static_cast<int>(std::size(kTemplates)); ++t) {
            std::vector<std::string> templates;
            if (t >= 0)
                templates.push_back(kTemplates[t]);
            SCOPED_TRACE(std::string(chart) + (t >= 0 ? " + " + templates[0] : ""));
            const Image image(drawn(chart, templates, 320, 240));
            ASSERT_TRUE(image.ok());
            // Something besides the page is drawn: text and the graph.
            EXPECT_GT(image.count(0, 0, 320, 240, [](const Rgb& p) { return p.r + p.g + p.b < 384; }), 200);
        }
    }
}

TEST(Render, RefusesWhatItCannotDraw) {
    ChartTransformer chart(sampleChart("simple-bar"));
    ChartRenderer renderer;
    std::string out = "stale";
    renderer.setSize(8, 8);
    EXPECT_FALSE(renderer.render(chart, ChartRenderer::PNG, out));
    EXPECT_TRUE(out.empty());
    EXPECT_FALSE(renderer.lastError().empty());
    ChartTransformer empty("not a chart");
    renderer.setSize(100, 100);
    EXPECT_FALSE(renderer.render(empty, ChartRenderer::PNG, out));
    ChartRenderer::Format f;
    EXPECT_TRUE(ChartRenderer::formatOf("a/b.Svg", f) && f == ChartRenderer::SVG);
    EXPECT_FALSE(ChartRenderer::formatOf("a.svg.txt", f));
}

} // namespace
