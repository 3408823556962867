// Lines, points and guides on pixels: dashes and gaps along a path, points in their cycle
// colours, a second y axis over the same data area, and the guides templates add.
#include "render/Pixels.h"

#include <gtest/gtest.h>

namespace {

// The graph frames of the samples at 640x480: 12%..80% across, 12%..85% down.
constexpr int kX0 = 77, kX1 = 512, kY0 = 58, kY1 = 408;

std::string drawnText(const std::string& chart, const std::string& templ = "") {
    ChartTransformer transformer(chart);
    if (!templ.empty() &&
        !transformer.applyTemplate(R"(<template xmlns="http://plotaid.org/grxml">)" + templ + "</template>"))
        return {};
    ChartRenderer renderer;
    renderer.setSize(640, 480);
    std::string out;
    return renderer.render(transformer, ChartRenderer::PNG, out) ? out : std::string();
}

std::string edited(std::string text, const std::string& from, const std::string& to) {
    const std::size_t at = text.find(from);
    return at == std::string::npos ? std::string() : text.replace(at, from.size(), to);
}

// Columns of the graph frame holding a pixel of colour c: their first, last, and the longest run
// of columns between them without one.
struct Columns {
    int first = -1, last = -1, longestGap = 0, missing = 0;
};
Columns columnsOf(const Image& image, const Rgb& c, int tolerance = 40) {
    Columns out;
    int run = 0;
    for (int x = kX0; x < kX1; ++x) {
        const bool hit =
            image.count(x, kY0, x + 1, kY1, [&](const Rgb& p) { return p.near(c, tolerance); }) > 0;
        if (hit) {
            out.first = out.first < 0 ? x : out.first;
            out.last = x;
            out.missing += run;
            out.longestGap = std::max(out.longestGap, run);
            run = 0;
        } else if (out.first >= 0) {
            ++run;
        }
    }
    return out;
}

const Rgb kBlue = hex(0x3E58AC), kGreen = hex(0x2EB848), kRed = hex(0xEF3338), kMagenta = hex(0xFF00FF);

TEST(RenderMarks, LinePathsTakeTheirDashAndBreakAtMissingValues) {
    const std::string lines = sampleChart("line-series");
    const std::string noJune = edited(lines, "<row>Jun;North;140.9</row>", "<row>Jun;North;</row>");
    struct Row {
        std::string chart;
        Rgb colour;
        int minMissing, maxMissing, minGap, maxGap;
    } rows[] = {
        {lines, kBlue, 0, 15, 0, 3},     // North: solid, but for where other lines cross it
        {lines, kGreen, 60, 250, 4, 20}, // South: "6 3" leaves short gaps all along
        {noJune, kBlue, 50, 90, 50, 90}, // a missing June breaks North for two months
        {edited(noJune, "breakRepresentation=\"gap\"", "breakRepresentation=\"interpolated\""), kBlue, 0, 15,
         0, 3},
    };
    for (const Row& r : rows) {
        const Image image(drawnText(r.chart));
        ASSERT_TRUE(image.ok());
        const Columns c = columnsOf(image, r.colour);
        SCOPED_TRACE(testing::Message()
                     << c.first << ".." << c.last << " missing " << c.missing << " gap " << c.longestGap);
        EXPECT_GT(c.last - c.first, 300); // Jan to Dec spans the data area
        EXPECT_GE(c.missing, r.minMissing);
        EXPECT_LE(c.missing, r.maxMissing);
        EXPECT_GE(c.longestGap, r.minGap);
        EXPECT_LE(c.longestGap, r.maxGap);
    }
}

TEST(RenderMarks, PointsTakeTheirCycleColoursAndTheFunctionGuideItsStyle) {
    const Image image(drawnText(sampleChart("scatter")));
    ASSERT_TRUE(image.ok());
    const auto inGraph = [&](const Rgb& c) {
        return image.count(kX0, kY0, kX1, kY1, [&](const Rgb& p) { return p.near(c, 40); });
    };
    EXPECT_GT(inGraph(kBlue), 500);  // women as circles
    EXPECT_GT(inGraph(kGreen), 500); // men as squares
    EXPECT_GT(inGraph(kRed), 60);    // y = 2x, dashed
}

TEST(RenderMarks, SecondCoordinatesShareTheDataAreaOfTheFirst) {
    const Image image(drawnText(sampleChart("dual-y-axis")));
    ASSERT_TRUE(image.ok());
    const Columns bars = columnsOf(image, kBlue, 6), line = columnsOf(image, kRed, 6);
    ASSERT_GT(bars.last, bars.first);
    ASSERT_GT(line.last, line.first);
    // The line runs from the first bar's centre to the last one's, markers overhanging a little.
    EXPECT_NEAR(line.first + line.last, bars.first + bars.last, 4);
    EXPECT_GT(line.first, bars.first);
    EXPECT_LT(line.last, bars.last);
    // Both y axes keep their room: tick labels left of the bars and right of them.
    EXPECT_GT(bars.first, kX0 + 60);
    EXPECT_LT(bars.last, kX1 - 50);
}

TEST(RenderMarks, GuidesFromTemplatesTakeTheirStyleColour) {
    struct Row {
        const char* chart;
        std::string instruction;
        int minPixels;
    } rows[] = {
        {"line-series",
         R"(<addReferenceLine y="120"><style value="stroke:#FF00FF;stroke-width:2pt"/></addReferenceLine>)",
         500},
        {"line-series",
         R"(<addOriginLine y="100"><style value="stroke:#FF00FF;stroke-width:2pt"/></addOriginLine>)", 300},
        {"scatter",
         R"(<addFitLine target="total" primary="true" type="linear"><style value="stroke:#FF00FF;stroke-width:2pt"/></addFitLine>)",
         500},
        {"simple-bar",
         R"(<addDataLabels labelLocationVertical="positive"><labeling variable="y"/><style color="#FF00FF" font-size="14pt"/></addDataLabels>)",
         40},
    };
    for (const Row& r : rows) {
        SCOPED_TRACE(r.chart + (" " + r.instruction));
        const Image before(drawnText(sampleChart(r.chart)));
        const Image after(drawnText(sampleChart(r.chart), r.instruction));
        ASSERT_TRUE(before.ok() && after.ok());
        const auto magenta = [](const Rgb& p) { return p.near(kMagenta, 40); };
        EXPECT_EQ(before.count(kX0, kY0, kX1, kY1, magenta), 0);
        EXPECT_GT(after.count(kX0, kY0, kX1, kY1, magenta), r.minPixels);
    }
}

} // namespace
