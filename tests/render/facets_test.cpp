// Faceted graphs and graphs in containers, judged on the pixels they draw.
#include "render/Pixels.h"

#include <plotaid/ChartRenderer.h>
#include <plotaid/ChartTransformer.h>

#include <gtest/gtest.h>

#include <fstream>
#include <sstream>
#include <utility>

namespace {

const Rgb kCell{255, 255, 0}, kRed{255, 0, 0}, kBlue{0x3E, 0x58, 0xAC}, kGreen{0x2E, 0xB8, 0x48},
    kKhaki{0xD3, 0xCE, 0x97}, kGraph{0xF0, 0xF0, 0xF0}, kWhite{255, 255, 255};

// A sample chart with some text replaced (the text from `from` through `through`, when given),
// drawn at 800x600.
struct Edit {
    Edit(std::string f, std::string t, std::string th = "") : from(f), to(t), through(th) {}
    std::string from, to, through;
};
Image draw(const std::string& sample, const std::vector<Edit>& edits = {}) {
    std::ifstream in(std::string(PLOTAID_EXAMPLES_DIR) + "/charts/" + sample, std::ios::binary);
    std::ostringstream s;
    s << in.rdbuf();
    std::string text = s.str();
    for (const Edit& e : edits)
        for (std::size_t at = text.find(e.from); at != std::string::npos;
             at = text.find(e.from, at + e.to.size())) {
            const std::size_t end =
                e.through.empty() ? at + e.from.size() : text.find(e.through, at) + e.through.size();
            text.replace(at, end - at, e.to);
        }
    ChartTransformer chart(text);
    ChartRenderer renderer;
    std::string png;
    EXPECT_TRUE(renderer.render(chart, ChartRenderer::PNG, png)) << renderer.lastError();
    return Image(png);
}

// The spans of x (or y) where some pixel has the colour; gaps of a few pixels are antialiasing.
std::vector<std::pair<int, int>> spans(const Image& image, Rgb c, bool vertical) {
    std::vector<std::pair<int, int>> out;
    for (int i = 0; i < (vertical ? image.height() : image.width()); ++i) {
        bool hit = false;
        for (int j = 0; j < (vertical ? image.width() : image.height()) && !hit; ++j)
            hit = vertical ? image.near(j, i, c, 4) : image.near(i, j, c, 4);
        if (hit && !out.empty() && i - out.back().second <= 4)
            out.back().second = i;
        else if (hit)
            out.push_back({i, i});
    }
    return out;
}

// The panels by cell colour, and the topmost row of a colour within each.
const Edit kYellowCells{"cellStyle=\"graphStyle\"", "cellStyle=\"cellTest\""};
const Edit kYellowStyle{"<style id=\"barStyle\"",
                        "<style id=\"cellTest\" color=\"#FFFF00\"/><style id=\"barStyle\""};

TEST(Facets, PanelsDrawOneCellPerGenderWithBarsOnSharedScales) {
    const Image image = draw("panels.xml", {kYellowCells, kYellowStyle});
    const auto xs = spans(image, kCell, false), ys = spans(image, kCell, true);
    ASSERT_EQ(xs.size(), 2u); // Female, Male
    ASSERT_EQ(ys.size(), 1u);
    int managerTop[2] = {};
    for (int p = 0; p < 2; ++p) {
        const auto [x0, x1] = xs[p];
        for (Rgb bar : {kBlue, kGreen, kKhaki})
            EXPECT_GT(image.count(x0, ys[0].first, x1, ys[0].second, bar, 4), 200) << "panel " << p;
        for (int y = ys[0].first; y < ys[0].second && !managerTop[p]; ++y)
            for (int x = x0; x < x1 && !managerTop[p]; ++x)
                managerTop[p] = image.near(x, y, kKhaki, 4) ? y : 0;
    }
    // One scale for both: female managers' mean salary stands above male managers'.
    EXPECT_LT(managerTop[0], managerTop[1] - 10);
}

TEST(Facets, MatrixDrawsEveryPairWithTheDiagonalStyleOnTheDiagonal) {
    // Bars stand in for points; the diagonal style paints red where the facets are equal.
    const Image image =
        draw("scatterplot-matrix.xml",
             {{"<point ", "<interval "},
              {"</point>", "</interval>"},
              {"cellStyle=\"graphStyle\"", "cellStyle=\"cellTest\""},
              {"<style id=\"diagonalStyle\" visible=\"false\" />",
               "<style id=\"diagonalStyle\" color=\"#FF0000\"/><style id=\"cellTest\" color=\"#FFFF00\"/>"}});
    const auto xs = spans(image, kCell, false), ys = spans(image, kCell, true);
    ASSERT_EQ(xs.size(), 4u);
    ASSERT_EQ(ys.size(), 4u);
    for (std::size_t i = 0; i < 4; ++i)
        for (std::size_t j = 0; j < 4; ++j) {
            const int red = image.count(xs[j].first, ys[i].first, xs[j].second, ys[i].second, kRed, 8);
            const int cycle = image.count(xs[j].first, ys[i].first, xs[j].second, ys[i].second, kBlue, 8) +
                              image.count(xs[j].first, ys[i].first, xs[j].second, ys[i].second, kGreen, 8);
            EXPECT_EQ(red > 20, i == j) << i << "," << j;
            EXPECT_EQ(cycle > 20, i != j) << i << "," << j;
        }
    // Each column plots its own variable: education's few values take fewer bars than salary's.
    const auto barColumns = [&](std::size_t j) {
        int n = 0;
        for (int x = xs[j].first; x < xs[j].second; ++x)
            n += image.count(x, ys[0].first, x + 1, ys[0].second, kBlue, 8) +
                     image.count(x, ys[0].first, x + 1, ys[0].second, kGreen, 8) >
                 0;
        return n;
    };
    EXPECT_LT(2 * barColumns(3), barColumns(1));
    // Only the outer panels paint axes: the gaps between panels hold no tick marks or labels.
    for (std::size_t k = 0; k + 1 < 4; ++k) {
        EXPECT_LT(
            image.count(xs[k].second + 3, ys[0].first, xs[k + 1].first - 2, ys[3].second, {0, 0, 0}, 100), 5);
        EXPECT_LT(
            image.count(xs[0].first, ys[k].second + 3, xs[3].second, ys[k + 1].first - 2, {0, 0, 0}, 100), 5);
    }
}

TEST(Facets, GraphsInAContainerDrawAtTheirOwnLocations) {
    // frame_graph_1 spans 8%..45% of the width, frame_graph_2 52%..90%; the page shows between. Alone
    // in its container, the first graph still keeps its place rather than being laid out anew.
    for (bool both : {true, false}) {
        const Image image = draw("container-lines.xml",
                                 both ? std::vector<Edit>{}
                                      : std::vector<Edit>{{"<graph id=\"frame_graph_2\"", "", "</graph>"}});
        for (const auto& [x0, x1] : {std::pair{0.09, 0.44}, std::pair{0.53, 0.89}}) {
            const int grey = image.count(int(x0 * 800), 200, int(x1 * 800), 400, kGraph, 2);
            EXPECT_EQ(grey > 0.3 * (x1 - x0) * 800 * 200, x0 < 0.5 || both) << both;
        }
        EXPECT_GT(image.count(int(0.46 * 800), 100, int(0.51 * 800), 500, kWhite, 2), 0.9 * 40 * 400) << both;
    }
}

} // namespace
