// "setColor": new colour cycles shared per tag, the selection by number, the affect modes, and the
// source guard.
#include "AestheticsSupport.h"

using namespace aesthetics_test;
using plotaid::detail::TSetColor;

namespace {

const std::string kStyles = "[({color=#010101;}{color=#020202;})]";

std::string setColor(const std::string& attributes = std::string()) {
    return "<setColor " + attributes +
           "><cycle><style color='#010101'/><style color='#020202'/></cycle></setColor>";
}

// Two intervals around a point, each with a colour by var_a on the chart's cycle; the intervals
// have a second colour without one.
const std::string kTags = chartWith(
    "<interval id='bars_1' coordinates='coordinates_1'><color id='a1' variable='var_a' cycle='chartCycle'/>"
    "<color id='a2' variable='var_b'/></interval><point id='marks' coordinates='coordinates_1'>"
    "<color id='m1' variable='var_a' cycle='chartCycle'/></point><interval id='bars_2' "
    "coordinates='coordinates_1'><color id='b1' variable='var_a' cycle='chartCycle'/>"
    "<color id='b2' variable='var_b'/></interval>");

using SetColor = AestheticsTest;

TEST_F(SetColor, ElementsOfOneTagShareOneNewCycleAndKeepTheirVariables) {
    GrxVisualization& chart = parse(kTags);
    EXPECT_TRUE(applyAction<TSetColor>(setColor(), chart));
    const std::string bars = cycleIdOf(chart, "a1");
    EXPECT_NE(bars, "chartCycle");
    EXPECT_NE(cycleIdOf(chart, "m1"), bars);
    EXPECT_EQ(cycleIdOf(chart, "b1"), bars);
    for (const char* id : {"a1", "m1", "b2"})
        EXPECT_EQ(stylesOf(chart, id), kStyles) << id;
    EXPECT_EQ(attribute(*byId<GrxColor>(chart, "m1"), "variable"), "var_a");
    // The chart's own cycle is still there for whatever else names it.
    EXPECT_NE(byId<GrxStyleCycle>(chart, "chartCycle"), nullptr);
}

TEST_F(SetColor, AnAestheticNumberSelectsByPositionAndWithoutACycleNothingChanges) {
    GrxVisualization& chart = parse(kTags);
    const std::size_t cyclesBefore = chart.getStyleCycles().size();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("aestheticNumber='2'"), chart));
    // The second bars continue the first bars' new cycle.
    EXPECT_EQ(chart.getStyleCycles().size(), cyclesBefore + 1);
    EXPECT_EQ(stylesOf(chart, "a2"), kStyles);
    EXPECT_EQ(cycleIdOf(chart, "b2"), cycleIdOf(chart, "a2"));
    for (const char* id : {"a1", "b1", "m1"})
        EXPECT_EQ(cycleIdOf(chart, id), "chartCycle") << id;

    const std::string before = chart.AsUTF8();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("aestheticNumber='3'"), chart));
    EXPECT_TRUE(applyAction<TSetColor>("<setColor affect='both'><style color='red'/></setColor>", chart));
    EXPECT_EQ(chart.AsUTF8(), before);
}

TEST_F(SetColor, AffectModesDependOnWhetherTheColourBelongsToAPoint) {
    // The sample has "secondary" on the interval's colour_1 and "main" on the point's colour_2.
    const struct {
        const char* affect;
        const char* interval;
        const char* point;
    } cases[] = {{"main", "main", "secondary"},
                 {"secondary", "secondary", "main"},
                 {"both", "both", "both"},
                 {"", "secondary", "main"}};
    for (const auto& c : cases) {
        SCOPED_TRACE(c.affect);
        GrxVisualization& chart = sample("error-bars.xml");
        EXPECT_TRUE(applyAction<TSetColor>(
            *c.affect ? setColor(std::string("affect='") + c.affect + "'") : setColor(), chart));
        EXPECT_EQ(attribute(*byId<GrxColor>(chart, "color_1"), "affect"), c.interval);
        EXPECT_EQ(attribute(*byId<GrxColor>(chart, "color_2"), "affect"), c.point);
    }
}

TEST_F(SetColor, ASourceThatSetsTheCycleKeepsTheColourAsItIs) {
    GrxVisualization& chart = sample("error-bars.xml");
    GrxVisualization& source = sample("error-bars.xml");
    byId<GrxColor>(source, "color_2")->removeCycle();
    EXPECT_TRUE(applyAction<TSetColor>(setColor("affect='both'"), chart, &source));
    EXPECT_EQ(cycleIdOf(chart, "color_1"), "styleCycleRepository");
    EXPECT_EQ(attribute(*byId<GrxColor>(chart, "color_1"), "affect"), "secondary");
    // Where the source's colour has no cycle, the template decides.
    EXPECT_EQ(stylesOf(chart, "color_2"), kStyles);
    EXPECT_EQ(attribute(*byId<GrxColor>(chart, "color_2"), "affect"), "both");
}

TEST_F(SetColor, AppliedTwiceItReadsAsOnce) {
    GrxVisualization& once = sample("error-bars.xml");
    GrxVisualization& twice = sample("error-bars.xml");
    for (GrxVisualization* chart : {&once, &twice, &twice})
        applyAction<TSetColor>(setColor("affect='main'"), *chart);
    EXPECT_EQ(canonical(twice), canonical(once));
    applyAction<TSetColor>("<setColor><cycle><style color='#999999'/></cycle></setColor>", twice);
    EXPECT_NE(canonical(twice), canonical(once));
}

} // namespace
