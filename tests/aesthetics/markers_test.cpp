// "setShowLineMarkers": point markers laid over a graph drawn by one line or path, with the line's
// dash series shown as the markers' shapes.
#include "AestheticsSupport.h"

#include "templates/actions/aesthetics.h"

using namespace aesthetics_test;
using plotaid::detail::TSetShowLineMarkers;

namespace {

const std::string kMarkers = "<setShowLineMarkers><style size='6pt' color2='#333333'/></setShowLineMarkers>";

using SetShowLineMarkers = AestheticsTest;

TEST_F(SetShowLineMarkers, ALoneLineGetsPointsThatShowItsSeriesOnce) {
    GrxVisualization& chart = sample("line-series.xml");
    const std::size_t legendTargets = chart.getLegends().front()->getLegendTargets().size();
    EXPECT_TRUE(applyAction<TSetShowLineMarkers>(kMarkers, chart));

    GrrUviza& graph = *chart.getGraphs().front();
    ASSERT_EQ(graph.getPoints().size(), 1u);
    const GrxPoint& point = *graph.getPoints().front();
    EXPECT_EQ(text(point.getId()), "point1");
    // Same data as the line.
    ASSERT_TRUE(point.getX() && point.getY());
    EXPECT_EQ(attribute(*point.getX(), "variable") + " " + attribute(*point.getY(), "variable"),
              "var_month var_sales");
    // Its own style, with the instruction's style in it.
    const GrxStyle* style = point.getStyle();
    ASSERT_NE(style, nullptr);
    EXPECT_NE(text(style->getId()), "lineStyle");
    EXPECT_EQ(attribute(*style, "size") + " " + attribute(*style, "color2"), "6pt #333333");

    // Colours fill the markers; the line's colour is untouched.
    ASSERT_FALSE(point.getColors().empty());
    for (const GrxColor* color : point.getColors()) {
        EXPECT_EQ(color->getAffect(), 3);
        EXPECT_EQ(attribute(*color, "variable"), "var_region");
    }
    EXPECT_EQ(attribute(*byId<GrxColor>(chart, "color_1"), "affect"), "secondary");

    // The dash series became a shape series without the dash cycle; no dash is left on the points.
    EXPECT_TRUE(point.getDashs().empty());
    ASSERT_EQ(point.getShapes().size(), 1u);
    const GrxShape& shape = *point.getShapes().front();
    EXPECT_EQ(text(shape.getId()).rfind("shape", 0), 0u);
    EXPECT_EQ(attribute(shape, "variable") + " " + attribute(shape, "domain"), "var_region domain_region");
    EXPECT_FALSE(shape.isCyclePresent());
    // ... and the legend shows it.
    const std::vector<GrxLegendTarget*> targets = chart.getLegends().front()->getLegendTargets();
    ASSERT_EQ(targets.size(), legendTargets + 1);
    EXPECT_EQ(targets.back()->getTarget(), &shape);
    EXPECT_EQ(text(targets.back()->getId()).rfind("legendTarget", 0), 0u);

    // The line keeps what it had.
    const GrxLine& line = *graph.getLines().front();
    EXPECT_EQ(line.getDashs().size() + line.getColors().size(), 2u);
    EXPECT_EQ(grammar_test::chartFaults(chart), "");

    // Now the graph holds a line and the markers: no longer a lone line, so nothing more is added.
    const std::string once = chart.AsUTF8();
    EXPECT_TRUE(applyAction<TSetShowLineMarkers>(kMarkers, chart));
    EXPECT_EQ(chart.AsUTF8(), once);
}

TEST_F(SetShowLineMarkers, ADashScaleAndStatisticGoOverToTheShapeAndNoDashesNoShape) {
    GrxVisualization& chart =
        parse(chartWith("    <path id='path_1' coordinates='coordinates_1'>\n"
                        "      <x variable='var_a'/><y variable='var_b'/>\n"
                        "      <dash id='dash_1' variable='var_a' cycle='chartCycle' name='series'>\n"
                        "        <scale method='log' base='2'/>\n"
                        "        <summaryStatistic method='4' variable='var_b'/>\n"
                        "      </dash>\n"
                        "    </path>\n"));
    EXPECT_TRUE(applyAction<TSetShowLineMarkers>("<setShowLineMarkers/>", chart));
    const std::vector<GrxPoint*> points = chart.getGraphs().front()->getPoints();
    ASSERT_EQ(points.size(), 1u);
    ASSERT_EQ(points.front()->getShapes().size(), 1u);
    const GrxShape& shape = *points.front()->getShapes().front();
    EXPECT_EQ(attribute(shape, "name"), "series");
    ASSERT_TRUE(shape.getScale() && shape.getSummaryStatistic());
    EXPECT_EQ(attribute(*shape.getScale(), "base"), "2");
    EXPECT_EQ(attribute(*shape.getSummaryStatistic(), "variable"), "var_b");
    // Without a style in the instruction the markers' style stays empty.
    ASSERT_NE(points.front()->getStyle(), nullptr);
    EXPECT_FALSE(points.front()->getStyle()->isSizePresent());
    EXPECT_EQ(grammar_test::chartFaults(chart), "");

    GrxVisualization& plain = parse(chartWith("    <line id='line_1' coordinates='coordinates_1'>\n"
                                              "      <color id='c' variable='var_a' cycle='chartCycle'/>\n"
                                              "    </line>\n"));
    EXPECT_TRUE(applyAction<TSetShowLineMarkers>("<setShowLineMarkers/>", plain));
    ASSERT_EQ(plain.getGraphs().front()->getPoints().size(), 1u);
    EXPECT_TRUE(plain.getGraphs().front()->getPoints().front()->getShapes().empty());
}

TEST_F(SetShowLineMarkers, OtherGraphsAreLeftAloneAndWithoutGraphsOrInstructionItFails) {
    for (const char* name : {"charts/dual-y-axis.xml", "charts/simple-bar.xml", "charts/scatter.xml"}) {
        SCOPED_TRACE(name);
        GrxVisualization& chart = parse(engine_test::example(name));
        const std::string before = chart.AsUTF8();
        EXPECT_TRUE(applyAction<TSetShowLineMarkers>(kMarkers, chart));
        EXPECT_EQ(chart.AsUTF8(), before);
    }
    Chart empty = Chart::empty();
    EXPECT_FALSE(applyAction<TSetShowLineMarkers>(kMarkers, *empty.vis));
    GrxVisualization& lines = sample("line-series.xml");
    const std::string before = lines.AsUTF8();
    TSetShowLineMarkers missing(nullptr, lines, nullptr);
    EXPECT_FALSE(missing.apply());
    EXPECT_EQ(lines.AsUTF8(), before);
}

} // namespace
