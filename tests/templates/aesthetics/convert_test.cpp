// "addDash" and "addImage": colour aesthetics turned into dash or image aesthetics that keep the
// colour's variable, domain and id under a new cycle. Both share one conversion; the walk's test
// shows "addImage" making images.
#include "AestheticsSupport.h"

using namespace aesthetics_test;
using plotaid::detail::TAddDash;

namespace {

// A line with a colour that carries every attribute, its own dash, and a bare colour; a legend
// listing both colours.
const std::string kChart = chartWith(
    "<line id='line_1' coordinates='coordinates_1'><color id='colour_a' variable='var_a' cycle='chartCycle' "
    "domain='domain_a' missing='gap' dimension='dim_x' clamp='true' split='false' affect='main'/>"
    "<dash id='dash_own' variable='var_a'/><color id='colour_b' variable='var_b'/></line>",
    "<legend id='legend_1'><legendTarget id='target_a' target='colour_a'/>"
    "<legendTarget id='target_b' target='colour_b'/></legend>\n");
const std::string kAddDash = "<addDash><cycle><style stroke-dasharray='3 1'/></cycle></addDash>";

using AddDash = AestheticsTest;

TEST_F(AddDash, EveryColourBecomesADashUnderItsIdOnce) {
    GrxVisualization& chart = parse(kChart);
    EXPECT_TRUE(applyAction<TAddDash>(kAddDash, chart));
    const GrxLine& line = *byId<GrxLine>(chart, "line_1");
    EXPECT_TRUE(line.getColors().empty());
    const std::vector<GrxDash*> dashes = line.getDashs();
    ASSERT_EQ(dashes.size(), 3u);
    EXPECT_EQ(text(dashes[1]->getId()) + " " + text(dashes[2]->getId()), "colour_a colour_b");
    const GrxDash* a = dashes[1];
    // Everything but the affect comes with it.
    std::string kept;
    for (const char* name : {"variable", "domain", "missing", "dimension", "clamp", "split"})
        kept += attribute(*a, name) + " ";
    EXPECT_EQ(kept, "var_a domain_a gap dim_x true false ");
    EXPECT_FALSE(a->isAttributePresent(u"affect"));
    EXPECT_NE(cycleIdOf(chart, "colour_a"), cycleIdOf(chart, "colour_b"));
    EXPECT_EQ(stylesOf(chart, "colour_b"), "[({stroke-dasharray=3 1;})]");
    // The legend shows what the colours were.
    EXPECT_EQ(byId<GrxLegendTarget>(chart, "target_a")->getTarget(), a);

    // Applied again it finds no colour left.
    const std::string once = chart.AsUTF8();
    EXPECT_TRUE(applyAction<TAddDash>(kAddDash, chart));
    EXPECT_EQ(chart.AsUTF8(), once);
}

TEST_F(AddDash, AnAestheticNumberAndACycleSelectWhatIsConverted) {
    GrxVisualization& chart = parse(kChart);
    const std::string before = chart.AsUTF8();
    EXPECT_TRUE(applyAction<TAddDash>("<addDash><style stroke-dasharray='3 1'/></addDash>", chart));
    EXPECT_EQ(chart.AsUTF8(), before);
    EXPECT_TRUE(applyAction<TAddDash>(
        "<addDash aestheticNumber='2'><cycle><style stroke-dasharray='3 1'/></cycle></addDash>", chart));
    const std::vector<GrxColor*> left = byId<GrxLine>(chart, "line_1")->getColors();
    ASSERT_EQ(left.size(), 1u);
    EXPECT_EQ(text(left.front()->getId()), "colour_a");
    EXPECT_NE(byId<GrxDash>(chart, "colour_b"), nullptr);
}

} // namespace
