// "setShowLineMarkers": point markers laid over a graph drawn by one line or path, with the line's
// dash series shown as the markers' shapes.
#include "AestheticsSupport.h"

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
    ASSERT_TRUE(point.getX() && point.getY() && point.getStyle());
    EXPECT_EQ(attribute(*point.getX(), "variable") + " " + attribute(*point.getY(), "variable"),
              "var_month var_sales");
    EXPECT_NE(text(point.getStyle()->getId()), "lineStyle");
    EXPECT_EQ(attribute(*point.getStyle(), "size") + " " + attribute(*point.getStyle(), "color2"),
              "6pt #333333");
    // Colours fill the markers; the line's colour is untouched.
    ASSERT_FALSE(point.getColors().empty());
    EXPECT_EQ(point.getColors().front()->getAffect(), 3);
    EXPECT_EQ(attribute(*byId<GrxColor>(chart, "color_1"), "affect"), "secondary");

    // The dash series became a shape series without the dash cycle, listed by the legend.
    EXPECT_TRUE(point.getDashs().empty());
    ASSERT_EQ(point.getShapes().size(), 1u);
    const GrxShape& shape = *point.getShapes().front();
    EXPECT_EQ(attribute(shape, "variable") + " " + attribute(shape, "domain"), "var_region domain_region");
    EXPECT_FALSE(shape.isCyclePresent());
    const std::vector<GrxLegendTarget*> targets = chart.getLegends().front()->getLegendTargets();
    ASSERT_EQ(targets.size(), legendTargets + 1);
    EXPECT_EQ(targets.back()->getTarget(), &shape);
    EXPECT_EQ(graph.getLines().front()->getDashs().size(), 1u);

    // The graph is no longer a lone line, so nothing more is added.
    const std::string once = chart.AsUTF8();
    EXPECT_TRUE(applyAction<TSetShowLineMarkers>(kMarkers, chart));
    EXPECT_EQ(chart.AsUTF8(), once);
}

TEST_F(SetShowLineMarkers, ADashScaleAndStatisticGoOverToTheShapeAndNoDashesNoShape) {
    GrxVisualization& chart = parse(chartWith(
        "<path id='path_1' coordinates='coordinates_1'><x variable='var_a'/><y variable='var_b'/>"
        "<dash id='dash_1' variable='var_a' cycle='chartCycle' name='series'><scale method='log' base='2'/>"
        "<summaryStatistic method='4' variable='var_b'/></dash></path>"));
    EXPECT_TRUE(applyAction<TSetShowLineMarkers>("<setShowLineMarkers/>", chart));
    const std::vector<GrxPoint*> points = chart.getGraphs().front()->getPoints();
    ASSERT_EQ(points.size(), 1u);
    ASSERT_EQ(points.front()->getShapes().size(), 1u);
    const GrxShape& shape = *points.front()->getShapes().front();
    EXPECT_EQ(attribute(shape, "name"), "series");
    ASSERT_TRUE(shape.getScale() && shape.getSummaryStatistic());
    EXPECT_EQ(attribute(*shape.getScale(), "base") + attribute(*shape.getSummaryStatistic(), "variable"),
              "2var_b");

    GrxVisualization& plain = parse(chartWith("<line id='line_1' coordinates='coordinates_1'>"
                                              "<color id='c' variable='var_a' cycle='chartCycle'/></line>"));
    EXPECT_TRUE(applyAction<TSetShowLineMarkers>("<setShowLineMarkers/>", plain));
    ASSERT_EQ(plain.getGraphs().front()->getPoints().size(), 1u);
    EXPECT_TRUE(plain.getGraphs().front()->getPoints().front()->getShapes().empty());
}

TEST_F(SetShowLineMarkers, OtherGraphsAreLeftAloneAndWithoutGraphsOrInstructionItFails) {
    GrxVisualization& bars = sample("simple-bar.xml");
    const std::string before = bars.AsUTF8();
    EXPECT_TRUE(applyAction<TSetShowLineMarkers>(kMarkers, bars));
    EXPECT_EQ(bars.AsUTF8(), before);
    Chart empty = Chart::empty();
    EXPECT_FALSE(applyAction<TSetShowLineMarkers>(kMarkers, *empty.vis));
    TSetShowLineMarkers missing(nullptr, sample("line-series.xml"), nullptr);
    EXPECT_FALSE(missing.apply());
}

} // namespace
