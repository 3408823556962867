// Statistical marks and special coordinates, on pixels: pies, pyramids, box plots, histograms
// and bars with depth; and the distribution figures behind them.
#include "render/Pixels.h"
#include "render/marks/Stats.h"

#include <gtest/gtest.h>

#include <cmath>
#include <regex>

namespace {

using namespace plotaid::render;

const Rgb kBlue = hex(0x3E58AC), kGreen = hex(0x2EB848), kSand = hex(0xD3CE97);
// The graph frames of the samples at 640x480: 12%..80% across, 12%..85% down.
constexpr int kX0 = 77, kX1 = 512, kY0 = 58, kY1 = 408;

std::string drawnText(const std::string& xml) {
    ChartTransformer chart(xml);
    ChartRenderer renderer;
    renderer.setSize(640, 480);
    std::string out;
    return renderer.render(chart, ChartRenderer::PNG, out) ? out : std::string();
}

// Bounds and mean of the graph's pixels near a colour.
struct Extent {
    int n = 0, x0 = 1 << 20, x1 = -1, y0 = 1 << 20, y1 = -1;
    double mx = 0;
};
Extent extentOf(const Image& img, const Rgb& c, int tolerance = 10) {
    Extent e;
    for (int y = kY0; y < kY1; ++y)
        for (int x = kX0; x < kX1; ++x)
            if (img.at(x, y).near(c, tolerance)) {
                ++e.n;
                e.x0 = std::min(e.x0, x), e.x1 = std::max(e.x1, x), e.y0 = std::min(e.y0, y),
                e.y1 = std::max(e.y1, y);
                e.mx += x;
            }
    e.mx /= std::max(e.n, 1);
    return e;
}

TEST(StatsRender, PieWedgesHoldTheCategorySharesInCycleColoursAndTurnBothWays) {
    const std::string xml = sampleChart("pie");
    for (bool back : {false, true}) {
        const Image img(drawnText(back ? std::regex_replace(xml, std::regex("counterClockwise=\"false\""),
                                                            "counterClockwise=\"true\"")
                                       : xml));
        ASSERT_TRUE(img.ok());
        const Extent e = extentOf(img, kBlue);
        const double cx = (e.x0 + e.x1) / 2.0, cy = (e.y0 + e.y1) / 2.0, r = (e.y1 - e.y0) / 2.0 * 0.6;
        // 90, 5 and 25 of the 120 employees, sampled round a circle inside the pie.
        const Rgb colours[] = {kBlue, kGreen, kSand};
        int hits[3] = {0, 0, 0}, all = 0;
        for (int i = 0; i < 720; ++i) {
            const Rgb p =
                img.at(int(cx + r * std::sin(i * M_PI / 360)), int(cy - r * std::cos(i * M_PI / 360)));
            for (int k = 0; k < 3; ++k)
                if (p.near(colours[k], 10))
                    ++hits[k], ++all;
        }
        EXPECT_NEAR(hits[0] / double(all), 0.75, 0.02);
        EXPECT_NEAR(hits[1] / double(all), 5 / 120.0, 0.02);
        EXPECT_NEAR(hits[2] / double(all), 25 / 120.0, 0.02);
        // Just clockwise of 12 o'clock: the first wedge, or the last when turning back.
        const Rgb first = img.at(int(cx + r * std::sin(0.3)), int(cy - r * std::cos(0.3)));
        EXPECT_TRUE(first.near(back ? kSand : kBlue, 10)) << back;
    }
}

TEST(StatsRender, PyramidSidesLieEitherSideOfTheCentreLine) {
    const Image img(drawn("population-pyramid"));
    ASSERT_TRUE(img.ok());
    const Extent male = extentOf(img, kBlue), female = extentOf(img, kGreen);
    ASSERT_GT(male.n, 1000);
    ASSERT_GT(female.n, 1000);
    EXPECT_LT(male.x1, female.x0);
    // Symmetric value scale: the centre line halves the graph, the age bands stack up it.
    EXPECT_NEAR((male.x1 + female.x0) / 2.0, (male.x0 + female.x1) / 2.0, 30);
    EXPECT_GT(male.y1 - male.y0, (kY1 - kY0) / 2);
}

TEST(StatsRender, BoxPlotDrawsItsMedianDarkAcrossTheBox) {
    const Image img(drawn("boxplot"));
    ASSERT_TRUE(img.ok());
    const Extent box = extentOf(img, kBlue);
    ASSERT_GT(box.n, 300);
    const int x = int(box.mx);
    int dark = 0;
    for (int y = box.y0; y < box.y1; ++y) {
        const Rgb p = img.at(x, y);
        dark += p.r + p.g + p.b < 200 ? 1 : 0;
    }
    EXPECT_GE(dark, 1); // the median line, with blue above and below
    EXPECT_TRUE(img.at(x, box.y0 + 1).near(kBlue, 10) && img.at(x, box.y1 - 1).near(kBlue, 10));
}

TEST(StatsRender, HistogramBarsTouchOneBarPerBin) {
    const std::string xml =
        std::regex_replace(sampleChart("histogram"), std::regex("<line id=\"line_normal\"[^]*?</line>"), "");
    const Image img(drawnText(xml));
    ASSERT_TRUE(img.ok());
    const Extent bars = extentOf(img, kBlue);
    ASSERT_GT(bars.n, 1000);
    // Just above the axis every bin from $15,000 to $85,000 has rows: blue runs with only outlines
    // between them.
    const int y = bars.y1 - 2;
    int runs = 0, background = 0;
    for (int x = bars.x0, inBlue = 0; x <= bars.x1; ++x) {
        const Rgb p = img.at(x, y);
        const int blue = p.near(kBlue, 10);
        runs += blue && !inBlue;
        inBlue = blue;
        background += p.near(hex(0xF0F0F0), 12) || p.near(hex(0xFFFFFF), 12);
    }
    EXPECT_EQ(background, 0);
    EXPECT_EQ(runs, 14);
}

TEST(StatsRender, BarsWithDepthShadeTheirSideAndSetTheSecondZCategoryBack) {
    const Image img(drawn("bar-3d"));
    ASSERT_TRUE(img.ok());
    auto darker = [](const Rgb& c, double f) { return Rgb{int(c.r * f), int(c.g * f), int(c.b * f)}; };
    for (const Rgb& c : {kBlue, kGreen}) {
        EXPECT_GT(extentOf(img, c, 6).n, 300);
        EXPECT_GT(extentOf(img, darker(c, 0.65), 6).n, 150);
        EXPECT_GT(extentOf(img, darker(c, 0.85), 6).n, 50);
    }
    const Extent front = extentOf(img, kBlue, 6), back = extentOf(img, kGreen, 6);
    EXPECT_GT(back.x1, front.x1);
    EXPECT_LT(back.y1, front.y1);
}

TEST(StatsRender, QuantilesAndIntervalMultipliers) {
    const std::vector<double> v = sortedFinite({7, NAN, 1, 3, 5, INFINITY, 9, 11, 13});
    const struct {
        double got, want;
    } rows[] = {
        {quantile(v, 0.5), 7},
        {quantile(v, 0.25), 3},
        {quantile(v, 0.75), 11},
        {quantile(v, 0.1), 1},
        {quantile({2, 4}, 0.5), 3},
        {mean({1, 2, NAN, 6}), 3},
        {standardDeviation({2, 4, 4, 4, 5, 5, 7, 9}), std::sqrt(32 / 7.0)},
        {normalQuantile(0.975), 1.959964},
        {normalQuantile(0.005), -2.575829},
        {tQuantile(0.975, 1), 12.7062},
        {tQuantile(0.975, 2), 4.3027},
        {tQuantile(0.975, 4), 2.7764},
        {tQuantile(0.975, 10), 2.2281},
        {tQuantile(0.995, 30), 2.7500},
    };
    for (const auto& r : rows)
        EXPECT_NEAR(r.got, r.want, 2e-3);
    EXPECT_TRUE(std::isnan(quantile({}, 0.5)) && std::isnan(standardDeviation({1})) &&
                std::isnan(tQuantile(1, 5)));
}

} // namespace
