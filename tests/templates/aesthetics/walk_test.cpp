// The nine aesthetic instructions through the real walk: each tag reaches its action.
#include "AestheticsSupport.h"

#include "templates/InstructionWalk.h"

#include <plotaid/ChartTemplate.h>

using namespace aesthetics_test;
using plotaid::detail::InstructionOutcome;

namespace {

using AestheticWalk = AestheticsTest;

TEST_F(AestheticWalk, EveryTagReachesItsActionThroughTheTemplate) {
    // A line with two colours, a dash and a size, a point with a shape, a pattern and three colours,
    // and a label frame; "addDash" takes the second colours, "addImage" then the first.
    GrxVisualization& chart = parse(chartWith(
        "<line id='line_1' coordinates='coordinates_1'><color id='colour_1' variable='var_a' "
        "cycle='chartCycle'/>"
        "<color id='colour_2' variable='var_a' cycle='chartCycle'/><dash id='dash_1' variable='var_a' "
        "cycle='chartCycle'/><size id='size_1' variable='var_b' low='1pt'/></line><point id='point_a' "
        "coordinates='coordinates_1'><shape id='shape_a' variable='var_a' cycle='chartCycle'/><pattern "
        "id='pattern_a' variable='var_a' cycle='chartCycle'/><color variable='var_a'/><color "
        "variable='var_a'/>"
        "<color id='colour_3' variable='var_a'/></point>",
        "<labelFrame id='frame_1'/>"));
    plotaid::detail::WalkReport report;
    ChartTemplate chartTemplate(chart, nullptr);
    ASSERT_TRUE(chartTemplate.setTemplate(
        templateOf("<setColor><cycle><style color='#101010'/></cycle></setColor>"
                   "<setDash><cycle><style stroke-dasharray='4 2'/></cycle></setDash>"
                   "<setPattern><cycle><style pattern='2'/></cycle></setPattern>"
                   "<setShape><cycle><style symbol='diamond'/></cycle></setShape>"
                   "<setSize><parameter name='small' value='3pt'/></setSize>"
                   "<setGenericAttributes elementName='labelFrame' styleName='style' font-style='normal'/>"
                   "<addDash aestheticNumber='2'><cycle><style stroke-dasharray='1 1'/></cycle></addDash>"
                   "<addImage aestheticNumber='1'><cycle><style color='#303030'/></cycle></addImage>"
                   "<setShowLineMarkers/>")));
    chartTemplate.applyTemplate();
    const std::vector<std::string> tags = {"setColor", "setDash",  "setPattern",
                                           "setShape", "setSize",  "setGenericAttributes",
                                           "addDash",  "addImage", "setShowLineMarkers"};
    ASSERT_EQ(report.outcomes().size(), tags.size());
    for (std::size_t i = 0; i < tags.size(); ++i) {
        EXPECT_EQ(report.outcomes()[i].tag, tags[i]);
        EXPECT_EQ(report.outcomes()[i].kind, InstructionOutcome::Applied) << tags[i];
    }
    // One visible effect per instruction.
    EXPECT_EQ(stylesOf(chart, "colour_3"), "[({color=#101010;})]");
    EXPECT_EQ(stylesOf(chart, "dash_1"), "[({stroke-dasharray=4 2;})]");
    EXPECT_EQ(stylesOf(chart, "pattern_a"), "[({pattern=2;})]");
    EXPECT_EQ(stylesOf(chart, "shape_a"), "[({symbol=diamond;})]");
    EXPECT_EQ(byId<GrxSize>(chart, "size_1")->getLengthMappings().size(), 1u);
    EXPECT_NE(byId<GrxLabelFrame>(chart, "frame_1")->getStyle(), nullptr);
    EXPECT_NE(byId<GrxDash>(chart, "colour_2"), nullptr);
    EXPECT_NE(byId<GrxImage>(chart, "colour_1"), nullptr);
    EXPECT_EQ(chart.getGraphs().front()->getPoints().size(), 1u); // not a lone line
}

} // namespace
